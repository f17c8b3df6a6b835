#pragma once

#include <termios.h>

/// Keeps the terminal on standard input from echoing for as long as this lives. Does nothing when
/// standard input is no terminal.
class SilentTerminal {
public:
    SilentTerminal();
    SilentTerminal(const SilentTerminal&) = delete;
    SilentTerminal& operator=(const SilentTerminal&) = delete;
    ~SilentTerminal();

private:
    termios _saved = {};
    const bool _isTerminal;
};
