#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace Author {

/// The name that was probably meant by a word: one that goes on where the word ends, or the nearest
/// one, when a few changes of single characters (Levenshtein's distance) lead there. Else empty.
std::string Nearest(std::string_view word, const std::vector<std::string>& names);

/// "; did you mean 'NAME'?" for a message, or nothing.
std::string Suggestion(std::string_view word, const std::vector<std::string>& names);

/// "a, b or c".
std::string JoinedByOr(const std::vector<std::string>& words, std::string_view last = " or ");

}  // namespace Author
