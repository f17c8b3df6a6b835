#pragma once

#include <regex.h>

#include <string>

namespace Host {

/// A POSIX extended regular expression, searched for anywhere in a text.
class Pattern {
public:
    explicit Pattern(const std::string& expression);
    Pattern(const Pattern&) = delete;
    Pattern& operator=(const Pattern&) = delete;
    ~Pattern();

    /// What is wrong with the expression; empty when it is valid.
    [[nodiscard]] std::string Complaint() const;
    /// Only for a valid expression.
    [[nodiscard]] bool Matches(const std::string& text) const;

private:
    regex_t _compiled = {};
    const int _error;
};

}  // namespace Host
