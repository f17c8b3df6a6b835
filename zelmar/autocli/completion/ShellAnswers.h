#pragma once

#include <zelmar/autocli/completion/BashLine.h>
#include <zelmar/autocli/completion/Completer.h>

#include <string>
#include <vector>

namespace AutoCli {

using Fields = std::vector<std::string>;

// What the shells are told. The scripts are short, for the work is here: what they get is ready to
// be inserted or shown. Each answer begins with the kind of files.

/// Then "nospace" or nothing, and the entries of COMPREPLY. Where several candidates have no more
/// in common than what is typed, these are a list of at most `columns` columns, unless
/// `insertsAll`.
Fields AnswerForBash(const BashLine& line, const Completion& completion, bool insertsAll,
                     size_t columns);

/// Then "nospace" or nothing, the stem, the message, all words to insert, and all entries for
/// _describe.
Fields AnswerForZsh(const Completion& completion);

/// Then the stem, the message, and the candidates with tab and description.
Fields AnswerForFish(const Completion& completion);

}  // namespace AutoCli
