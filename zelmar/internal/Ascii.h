#pragma once

#include <algorithm>
#include <string_view>

/// Character classes that no locale can change: names and options mean the same everywhere.
namespace Ascii {

constexpr bool IsLower(char c) {
    return c >= 'a' && c <= 'z';
}

constexpr bool IsUpper(char c) {
    return c >= 'A' && c <= 'Z';
}

constexpr bool IsDigit(char c) {
    return c >= '0' && c <= '9';
}

constexpr bool IsAlpha(char c) {
    return IsLower(c) || IsUpper(c);
}

constexpr bool IsAlnum(char c) {
    return IsAlpha(c) || IsDigit(c);
}

/// Not empty, and every character passes.
template <class Predicate>
constexpr bool ConsistsOf(std::string_view text, Predicate passes) {
    return !text.empty() && std::ranges::all_of(text, passes);
}

}  // namespace Ascii
