#pragma once

#include <chrono>
#include <cstddef>
#include <string>

namespace Author {

/// What came of a line for the shell.
struct ShellRun {
    enum class End {
        Itself,         ///< it ended, and closed its standard output
        Interrupted,    ///< by Ctrl-C, or a signal that asks zelmar to end
        ReadsTerminal,  ///< it was stopped when it read the terminal
        LeavesOpen,     ///< it ended, and left something in the background that holds the pipe
        Floods,         ///< it printed more than `mostOutput`
    };
    End end = End::Itself;
    int status = 0;  ///< as `waitpid` stored it
    std::chrono::duration<double> time{};
    std::string output;
    std::string errors;      ///< their first 64 KiB
    size_t errorBytes = 0;   ///< in all
    bool inputLeft = false;  ///< it closed its standard input before it had read a long text
};

constexpr size_t mostOutput = size_t{64} * 1024 * 1024;

/// Runs `/bin/sh -c <line>` as `AutoCli_ShellCmd` does, but in a process group of its own, with a
/// pipe for the error stream, and with bounds: whatever does not end by itself is ended with all
/// processes of the group. What runs on behind one that ended by itself is left alone. Throws
/// `std::system_error`.
ShellRun RunLine(const std::string& line, const std::string& input);

}  // namespace Author
