#pragma once

#include <optional>
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

/// Each condition becomes its body.
void ReplaceConditions(std::string& text, std::string_view name);
void ReplaceValues(std::string& text, std::string_view name, std::string_view value);
void ReplaceJoinedLists(std::string& text, std::string_view name, std::string_view list);
void ReplaceRepeatedLists(std::string& text, std::string_view name, std::string_view list);

/// The last value form, which decides for all of them.
struct LastValue {
    bool isQuoted;  ///< a single quote stands on either side
};
[[nodiscard]] std::optional<LastValue> FindLastValue(std::string_view text, std::string_view name);

/// The arguments of the last list form, which hold for all of them.
struct ListArguments {
    std::string text;  ///< the separator or the prefix
    bool quote;
};
[[nodiscard]] std::optional<ListArguments> FindLastJoinedList(std::string_view text,
                                                              std::string_view name);
[[nodiscard]] std::optional<ListArguments> FindLastRepeatedList(std::string_view text,
                                                                std::string_view name);

}  // namespace AutoCli
