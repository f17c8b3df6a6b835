// A line of bash up to the cursor, and what is inserted at its end: it must be read back as it was.

#include <zelmar/autocli/completion/BashLine.h>
#include <zelmar/internal/ControlCharacters.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>

using AutoCli::BashLine;

namespace {

void Require(bool holds) {
    if (!holds) {
        std::abort();
    }
}

// The line editor puts the text in the place of what it replaces, and closes an open quote unless
// the text ends with one.
void RequireReadBack(const BashLine& line, const std::string& head, const std::string& text) {
    const std::string quoted = AutoCli::QuoteForBash(text, line.quote);
    for (size_t i = 0; i < quoted.size(); ++i) {
        Require(FindControlCharacter(std::string_view(quoted).substr(i)).length == 0);
    }
    const char mark = line.quote == BashLine::Quote::Double ? '"' : '\'';
    const bool isClosed = line.quote == BashLine::Quote::None || quoted.ends_with(mark);
    const auto again = AutoCli::ReadBashLine(head + quoted + (isClosed ? "" : std::string(1, mark)),
                                             "\"'@><=;|&(:");
    Require(again.quote == BashLine::Quote::None);
    Require(again.words.size() == line.words.size());
    Require(again.words.back() == line.words.back().substr(0, line.kept) + text);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string input(reinterpret_cast<const char*>(data), size);
    const size_t split = std::min(input.find('\n'), input.size());
    const std::string typed = input.substr(0, split);
    const BashLine line = AutoCli::ReadBashLine(typed, "\"'@><=;|&(:");
    Require(typed.ends_with(line.replaced) && line.kept <= line.words.back().size());
    const std::string head = typed.substr(0, typed.size() - line.replaced.size());
    // A backslash that stands last takes part in what follows; so does a dollar sign ahead of a
    // quote.
    if (!head.ends_with('\\') && !head.ends_with('$')) {
        RequireReadBack(line, head, input.substr(split));
    }
    return 0;
}
