#pragma once

#include <sys/types.h>

#include <optional>
#include <string>

namespace Host {

/// The number itself for a user without a name.
std::string UserName(uid_t user);

/// The user of that name, or of that decimal number.
std::optional<uid_t> FindUser(const std::string& name);

}  // namespace Host
