#pragma once

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace Author {

/// A file that a page has written into its folder.
struct PageFile {
    std::string name;
    std::string mode;  ///< as `chmod` takes it
    std::string text;
};

/// A command of a page, and what the page shows of it.
struct PageCommand {
    size_t line = 0;  ///< of its first line
    std::string text;
    size_t shownLine = 0;  ///< of the first line that is shown, or would be
    std::string shown;     ///< whole lines
    bool isExact = false;  ///< whether streams and status are told apart
};

using PageStep = std::variant<PageFile, PageCommand>;

/// A Markdown page with files and console blocks, as the help of `zelmar test` describes them.
/// Lines count from 1.
struct Page {
    std::string path;
    std::vector<std::string> lines;  ///< each with its line feed
    std::vector<PageStep> steps;     ///< in the order of the page
};

/// What a page cannot say, as "PATH:LINE: error: TEXT".
struct FaultyPage : std::runtime_error {
    using std::runtime_error::runtime_error;
};

/// Throws `Unreadable` or `FaultyPage`.
Page ReadPage(const std::string& path);

/// The lines of a text, each with its line feed; a last line may have none.
std::vector<std::string> LinesOf(std::string_view text);

/// Whether a text is what is shown, in which a line "..." stands for any lines.
bool Matches(const std::vector<std::string>& shown, const std::vector<std::string>& printed);

}  // namespace Author
