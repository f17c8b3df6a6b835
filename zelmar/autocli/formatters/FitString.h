#pragma once

#include <zelmar/Export.h>

#include <iosfwd>
#include <string>

namespace AutoCli {

/// Wraps a text at blanks, so that it begins behind column `indent` and does not pass column
/// `width`, counted in bytes. A word is never broken: one that is too long stands alone on its line
/// and overflows it. With a `width` of at most `indent` nothing is wrapped. An indentation of 0 is
/// written as one blank.
///
/// The first indentation can be left out, for a caller who has written up to that column. With
/// `splitLines`, each line of the text is wrapped by itself. `breakChar` stands at the end of each
/// line that was broken; 0 stands for a blank. `endLine` ends the last line.
ZELMAR_EXPORT void AutoCli_FitString(const int& indent, const int& width, const std::string& text,
                                     bool skipFirstIndent, std::ostream& out, bool endLine,
                                     char breakChar, bool splitLines);

}  // namespace AutoCli
