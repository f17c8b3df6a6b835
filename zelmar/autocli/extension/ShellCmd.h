#pragma once

#include <zelmar/Export.h>

#include <string>

namespace AutoCli {

/// Runs `/bin/sh -c <command>` and waits for it to end, without a time limit. `input` goes to its
/// standard input, what it prints is appended to `output`, and it writes its errors to the caller's
/// descriptor 2. However much is written and printed, neither side waits for the other. It sees the
/// caller's environment and signal mask, and `SIGPIPE` at its default; of the caller's own signals
/// nothing changes. Returns the raw status that `waitpid` stored.
///
/// Throws `ZelmarException`: "Can't create input pipe: <reason>"; "Can't create output pipe:
/// <reason>"; "Failed to call process '<command>': <reason>"; "Unable to write to sub-process:
/// <reason>", as when the process closes its standard input or ends before it has read an `input`
/// that is larger than a pipe holds (a smaller one is written before the process starts, which need
/// not read it); "Unable to read from sub-process: <reason>"; "Error waiting for process
/// '<command>': <reason>". After a failed write or read the pipes are closed first, and the process
/// is then waited for, too; the listener does not hear of it.
ZELMAR_EXPORT int AutoCli_ShellCmd(const std::string& command, std::string& output,
                                   const std::string& input);

/// The same with the user's name in the environment variable `OX_USERNAME` of the first simple
/// command; an empty name sets none.
ZELMAR_EXPORT int AutoCli_ShellCmdWithOxUsername(const std::string& command,
                                                 const std::string& username, std::string& output,
                                                 const std::string& input);

/// Hears each command that has ended: the line as the shell got it, and its raw status.
using CommandExecListener = void (*)(const std::string& command, int status);
/// Makes the option for `/bin/sh` in front of `-c`; none when the text is empty. It is given -1.
using ChildRpDrnOptionMaker = std::string (*)(int);

/// The hooks of the host, one of each for the process; null takes it away. Not to be set while a
/// command runs in another thread.
ZELMAR_EXPORT void SetCommandExecListener(CommandExecListener listener);
ZELMAR_EXPORT void SetChildRpDrnOptionMaker(ChildRpDrnOptionMaker maker);

/// What the maker makes; empty when none is set.
ZELMAR_EXPORT std::string MakeChildRpDrnOption(int argument);

}  // namespace AutoCli
