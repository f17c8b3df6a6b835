#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace AutoCli {

/// A command line of bash up to the cursor, taken apart as bash would, though nothing is expanded:
/// of `$(touch x)` the words are just what is typed.
struct BashLine {
    /// How the place is quoted at which something is inserted.
    enum class Quote { None, Single, Double, Ansi };

    std::vector<std::string> words;  ///< without their quotes; the last one ends at the cursor

    // What the line editor replaces is the end of the last word: behind an open quote, or behind
    // the last of COMP_WORDBREAKS outside of quotes.
    size_t kept = 0;       ///< how much of the last word, without its quotes, stands ahead of it
    std::string replaced;  ///< the end itself, as it was typed
    Quote quote = Quote::None;
};

BashLine ReadBashLine(std::string_view line, std::string_view wordBreaks);

/// The text as it is to be inserted, so that bash reads back that very text, runs none of it and
/// shows none of its control characters to the terminal.
std::string QuoteForBash(std::string_view text, BashLine::Quote quote);

}  // namespace AutoCli
