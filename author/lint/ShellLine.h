#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace Author {

/// What the quotes around a character of a shell line make of it. In backquotes, single quotes keep
/// backquotes and backslashes no longer.
enum class Quoting : char { Bare, Single, SingleInBackquotes, Double, Comment };

/// The first word of a simple command.
struct ShellWord {
    std::string text;     ///< without its quotes
    bool isPlain = true;  ///< nothing in it is expanded
};

/// A line as a POSIX shell takes it apart: far enough to tell what a value would be at a place.
struct ShellLine {
    std::vector<Quoting> quoting;  ///< of each character
    std::vector<bool> beginsWord;  ///< for each character
    std::vector<ShellWord> commands;
    bool isClosed = true;  ///< all quotes and substitutions end
    bool hasHereDocument = false;
    bool closesGroup = false;  ///< a closing brace stands where a command begins
};

ShellLine ReadShellLine(std::string_view text);

}  // namespace Author
