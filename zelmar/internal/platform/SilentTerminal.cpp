#include <zelmar/internal/platform/FileDescriptor.h>
#include <zelmar/internal/platform/SilentTerminal.h>

#include <fcntl.h>
#include <termios.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <csignal>

namespace {

constexpr std::array<int, 5> watchedSignals = {SIGHUP, SIGINT, SIGQUIT, SIGTERM, SIGTSTP};

// Statics, since a handler reaches nothing else; all that it calls may be called from one.
termios shown = {};
termios silent = {};
std::array<struct sigaction, watchedSignals.size()> actionsBefore = {};

const struct sigaction& ActionBefore(int signal) {
    size_t i = 0;
    while (watchedSignals[i] != signal) {
        ++i;
    }
    return actionsBefore[i];
}

// Lets the signal do what it would have done, which may end or stop the process here.
void PassOn(int signal) {
    struct sigaction ours = {};
    sigset_t thisOne;
    sigset_t blocked;
    sigemptyset(&thisOne);
    sigaddset(&thisOne, signal);
    sigaction(signal, &ActionBefore(signal), &ours);
    raise(signal);
    pthread_sigmask(SIG_UNBLOCK, &thisOne, &blocked);
    pthread_sigmask(SIG_SETMASK, &blocked, nullptr);
    sigaction(signal, &ours, nullptr);
}

void Interrupted(int signal) {
    const int error = errno;
    tcsetattr(STDIN_FILENO, TCSANOW, &shown);
    PassOn(signal);
    tcsetattr(STDIN_FILENO, TCSANOW, &silent);
    errno = error;
}

// A signal that the process ignores stays ignored. A read goes on behind a signal unless the host
// wants its own handler to break it off.
void Watch(int signal, struct sigaction& before) {
    sigaction(signal, nullptr, &before);
    if (before.sa_handler == SIG_IGN) {
        return;
    }
    struct sigaction watched = {};
    watched.sa_handler = &Interrupted;
    watched.sa_flags = before.sa_handler == SIG_DFL ? SA_RESTART : before.sa_flags & SA_RESTART;
    sigaction(signal, &watched, nullptr);
}

}  // namespace

SilentTerminal::SilentTerminal() : _isTerminal(tcgetattr(STDIN_FILENO, &shown) == 0) {
    if (!_isTerminal) {
        return;
    }
    silent = shown;
    silent.c_lflag &= ~static_cast<tcflag_t>(ECHO);
    for (size_t i = 0; i < watchedSignals.size(); ++i) {
        Watch(watchedSignals[i], actionsBefore[i]);
    }
    tcsetattr(STDIN_FILENO, TCSANOW, &silent);
}

SilentTerminal::~SilentTerminal() {
    if (!_isTerminal) {
        return;
    }
    tcsetattr(STDIN_FILENO, TCSANOW, &shown);
    for (size_t i = 0; i < watchedSignals.size(); ++i) {
        sigaction(watchedSignals[i], &actionsBefore[i], nullptr);
    }
}

bool WriteBesideOutput(std::string_view text) {
    // Only the controlling terminal has a foreground group that this process may ask for.
    if (isatty(STDOUT_FILENO) == 1 || tcgetpgrp(STDIN_FILENO) < 0) {
        return false;
    }
    const FileDescriptor terminal(open("/dev/tty", O_WRONLY | O_CLOEXEC | O_NOCTTY));
    return write(terminal.Get(), text.data(), text.size()) == static_cast<ssize_t>(text.size());
}
