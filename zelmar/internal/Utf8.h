#pragma once

#include <cstddef>
#include <string_view>

// Reading bytes as UTF-8.

/// What stands at the front of a text.
struct Utf8Sequence {
    size_t length;  ///< bytes, at least 1
    /// One character; otherwise the bytes belong to none, and one U+FFFD would stand for them: they
    /// are the longest beginning of a character that is broken off, or one byte (Unicode Standard,
    /// 3.9, "U+FFFD Substitution of Maximal Subparts").
    bool isWellFormed;
};

/// The text must not be empty.
Utf8Sequence LeadingSequence(std::string_view text);
