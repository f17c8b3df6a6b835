#include "Pattern.h"

#include <array>

namespace Host {

Pattern::Pattern(const std::string& expression)
    : _error(regcomp(&_compiled, expression.c_str(), REG_EXTENDED | REG_NOSUB)) {}

Pattern::~Pattern() {
    if (_error == 0) {
        regfree(&_compiled);
    }
}

std::string Pattern::Complaint() const {
    if (_error == 0) {
        return "";
    }
    std::array<char, 256> text = {};
    regerror(_error, &_compiled, text.data(), text.size());
    return text.data();
}

bool Pattern::Matches(const std::string& text) const {
    return regexec(&_compiled, text.c_str(), 0, nullptr, 0) == 0;
}

}  // namespace Host
