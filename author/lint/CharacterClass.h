#pragma once

#include <author/lint/Expression.h>

#include <string_view>

namespace Author {

/// What is not known to the reader of expressions.
struct NotComputed {};

CharacterSet Single(char c);
CharacterSet Range(char first, char last);
/// The letters in it with those of the other case.
CharacterSet WithBothCases(CharacterSet characters);

/// The set that an escape stands for; `at` stands behind the backslash and moves behind the escape.
/// Throws `NotComputed`.
CharacterSet ReadEscape(std::string_view text, size_t& at);

/// The set in brackets; `at` stands behind the opening one and moves behind the closing one.
/// Throws `NotComputed`.
CharacterSet ReadClass(std::string_view text, size_t& at);

}  // namespace Author
