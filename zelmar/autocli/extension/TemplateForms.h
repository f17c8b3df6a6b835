#pragma once

#include <functional>
#include <string>
#include <string_view>

// The forms of the template language, found in a text and replaced. A form is what its expression
// says, with `.` matching any character and `+?` as few as possible:
//
//     value          \$val\{<name>\}
//     condition      \$if\{<name>,(.+?)\}
//     joined list    \$list\{<name>,'(.?)',(true|false)\}
//     repeated list  \$multilist\{<name>,(.+?),(true|false)\}
//
// All matches from left to right are replaced, none inside another one. The scans are linear in the
// text, however many forms it holds that open and never close.

namespace AutoCli {

/// The value of all value forms; given is whether a single quote stands on either side of the last.
using ValueMaker = std::function<std::string(bool isQuoted)>;
void ReplaceValues(std::string& text, std::string_view name, const ValueMaker& value);

/// Each condition becomes its body.
void ReplaceConditions(std::string& text, std::string_view name);

/// What all list forms of a kind become; given are the arguments of the last: the separator or the
/// prefix, and the quote word.
using ListMaker = std::function<std::string(std::string_view argument, bool quote)>;
void ReplaceJoinedLists(std::string& text, std::string_view name, const ListMaker& list);
void ReplaceRepeatedLists(std::string& text, std::string_view name, const ListMaker& list);

}  // namespace AutoCli
