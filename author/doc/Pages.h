#pragma once

#include <author/doc/Reference.h>

#include <string>

namespace Author {

/// A reference as one page of CommonMark: a heading for each namespace and each command. Texts of
/// declarations stand there as texts, whatever characters they hold.
std::string AsMarkdown(const Json& reference);

/// The manual page of one command of a reference, for `man` (the macros of man(7)), with this date.
/// Texts stand there as texts, in ASCII.
std::string AsManualPage(const Json& command, const std::string& date);
/// "kelvash-account-user-list"
std::string ManualName(const Json& command);

}  // namespace Author
