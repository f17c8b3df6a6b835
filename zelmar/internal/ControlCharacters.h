#pragma once

#include <string>
#include <string_view>

/// Characters that a terminal obeys instead of showing them, in UTF-8: C0, DEL, C1, the separators
/// of lines and paragraphs U+2028 and U+2029, and what turns the direction of writing, U+202A to
/// U+202E and U+2066 to U+2069.
struct ControlCharacter {
    size_t length = 0;  ///< in bytes; 0 when there is none
    unsigned code = 0;
};

/// The one with which the text begins.
ControlCharacter FindControlCharacter(std::string_view text);

/// The text with `\x1b` or `\u202e` in the place of each but those that `kept` names. So
/// stands `\x9b` for a byte 80 to 9F that belongs to no character: some terminals take it for C1.
std::string ShowControlCharacters(std::string_view text, std::string_view kept = "");
