#include <zelmar/internal/platform/SilentTerminal.h>

#include <unistd.h>

SilentTerminal::SilentTerminal() : _isTerminal(tcgetattr(STDIN_FILENO, &_saved) == 0) {
    if (_isTerminal) {
        termios silent = _saved;
        silent.c_lflag &= ~static_cast<tcflag_t>(ECHO);
        tcsetattr(STDIN_FILENO, TCSANOW, &silent);
    }
}

SilentTerminal::~SilentTerminal() {
    if (_isTerminal) {
        tcsetattr(STDIN_FILENO, TCSANOW, &_saved);
    }
}
