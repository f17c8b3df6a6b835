#pragma once

#include <cstddef>
#include <string_view>

/// Does the locale that the environment asks for take texts as UTF-8? Not where there is no such
/// locale. The locale of the process stays as it is.
bool LocaleIsUtf8();

/// The columns of a terminal that a text of UTF-8 takes, by `wcwidth`, whatever the locale: none
/// for what combines with the character ahead of it, two for a wide one. What is no character, or
/// not known to the C library, takes one.
size_t ColumnsOf(std::string_view text);
