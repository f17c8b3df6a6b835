#pragma once

#include <string_view>

/// Keeps the terminal on standard input from echoing for as long as this lives. A signal that ends
/// or stops the process (Ctrl-C, Ctrl-Z, a hang-up) finds the terminal as it was; what goes on
/// behind it, as by `fg` or by a handler of the host's, finds it silent again. Does nothing when
/// standard input is no terminal. One at a time in a process, as there is one terminal.
class SilentTerminal {
public:
    SilentTerminal();
    SilentTerminal(const SilentTerminal&) = delete;
    SilentTerminal& operator=(const SilentTerminal&) = delete;
    ~SilentTerminal();

    [[nodiscard]] bool IsTerminal() const { return _isTerminal; }

private:
    const bool _isTerminal;
};

/// Writes to the controlling terminal where standard input is it and standard output is no terminal
/// at all: where a prompt on standard output would end up in the result. Otherwise writes nothing
/// and is false.
bool WriteBesideOutput(std::string_view text);
