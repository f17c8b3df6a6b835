#pragma once

#include <zelmar/Export.h>

namespace AutoCli {

class Dispatcher;

/// Answers a shell that asks what can follow on a line, and ends the process with `exit`. Returns
/// at once when nobody asks. A host calls it when the tree is filled, ahead of
/// `CliDispatcher::HandleArgvInput`.
///
/// A shell asks through the variable `ZELMAR_COMPLETE`, which names it: `bash`, `zsh` or `fish`. It
/// tells the line on standard input and finds the answer on standard output, both as texts that end
/// with zero bytes; what they are is between this function and the scripts in
/// `kelvash/completions`. Plugins that the line names are loaded first. Nothing is said on the
/// error stream.
ZELMAR_EXPORT void AutoCli_AnswerCompletion(Dispatcher& dispatcher);

}  // namespace AutoCli
