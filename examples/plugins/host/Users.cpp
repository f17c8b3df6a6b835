#include "Users.h"

#include <pwd.h>

#include <array>
#include <charconv>

namespace Host {

namespace {

using EntryBuffer = std::array<char, 16384>;

}  // namespace

std::string UserName(uid_t user) {
    EntryBuffer buffer;
    passwd entry = {};
    passwd* found = nullptr;
    getpwuid_r(user, &entry, buffer.data(), buffer.size(), &found);
    return found ? found->pw_name : std::to_string(user);
}

std::optional<uid_t> FindUser(const std::string& name) {
    EntryBuffer buffer;
    passwd entry = {};
    passwd* found = nullptr;
    getpwnam_r(name.c_str(), &entry, buffer.data(), buffer.size(), &found);
    if (found) {
        return found->pw_uid;
    }
    uid_t number = 0;
    const char* const end = name.data() + name.size();
    const auto [rest, error] = std::from_chars(name.data(), end, number);
    return error == std::errc() && rest == end ? std::optional(number) : std::nullopt;
}

}  // namespace Host
