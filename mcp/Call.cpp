#include "Call.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <iostream>
#include <system_error>

namespace {

constexpr size_t longestLogLine = 4096;

struct PipeEnds {
    Descriptor read, write;
};

[[noreturn]] void Fail(const char* what) {
    throw std::system_error(errno, std::generic_category(), what);
}

PipeEnds OpenPipe() {
    int ends[2];
    if (pipe2(ends, O_CLOEXEC) != 0) {
        Fail("Cannot open a pipe");
    }
    fcntl(ends[0], F_SETFL, O_NONBLOCK);
    return {Descriptor(ends[0]), Descriptor(ends[1])};
}

// As a program expects to find them.
void ResetSignals() {
    std::signal(SIGPIPE, SIG_DFL);
    std::signal(SIGTERM, SIG_DFL);
    std::signal(SIGINT, SIG_DFL);
    std::signal(SIGHUP, SIG_DFL);
    sigset_t none;
    sigemptyset(&none);
    sigprocmask(SIG_SETMASK, &none, nullptr);
}

bool WriteAll(int descriptor, std::string_view text) {
    while (!text.empty()) {
        const ssize_t count = write(descriptor, text.data(), text.size());
        if (count < 0 && errno != EINTR) {
            return false;
        }
        text.remove_prefix(count < 0 ? 0 : static_cast<size_t>(count));
    }
    return true;
}

}  // namespace

Call::Call(const std::function<std::string()>& work) : _lines(longestLogLine) {
    PipeEnds result = OpenPipe();
    PipeEnds log = OpenPipe();
    _pid = fork();
    if (_pid < 0) {
        Fail("Cannot start a process");
    }
    if (_pid == 0) {
        Work(work, std::move(result.write), std::move(log.write));
    }
    setpgid(_pid, _pid);  // in both processes, for either may be first to need it
    // The C library declares a function for this that C++ cannot link.
    _process = Descriptor(static_cast<int>(syscall(SYS_pidfd_open, _pid, 0)));
    _result = std::move(result.read);
    _log = std::move(log.read);
}

Call::~Call() {
    if (_endWanted || !HasEnded()) {
        kill(-_pid, SIGKILL);
    }
    waitpid(_pid, nullptr, 0);
}

void Call::Work(const std::function<std::string()>& work, Descriptor result, Descriptor log) {
    setpgid(0, 0);
    ResetSignals();
    dup2(log.Get(), STDOUT_FILENO);
    dup2(log.Get(), STDERR_FILENO);
    const bool written = WriteAll(result.Get(), work());
    std::cout.flush();
    std::fflush(stdout);
    _exit(written ? EXIT_SUCCESS : EXIT_FAILURE);
}

void Call::Read() {
    ReadResult();
    pollfd log = {_log.Get(), POLLIN, 0};
    // Of a flood only so much at a time, so that it does not hold up the others.
    for (int blocks = 0; blocks < 16 && poll(&log, 1, 0) == 1; ++blocks) {
        if (!_lines.Read(_log.Get())) {
            _log = Descriptor();
            return;
        }
    }
}

void Call::ReadResult() {
    std::array<char, 65536> block;
    ssize_t count = 0;
    while ((count = read(_result.Get(), block.data(), block.size())) > 0) {
        _text.append(block.data(), static_cast<size_t>(count));
    }
}

// The process stays uncollected until this object goes: as long as it is there, nobody else can
// become the leader of a group of its number.
bool Call::HasEnded() const {
    siginfo_t info = {};
    return waitid(P_PID, static_cast<id_t>(_pid), &info, WEXITED | WNOHANG | WNOWAIT) == 0 &&
           info.si_pid == _pid;
}

std::string Call::CauseOfDeath() const {
    siginfo_t info = {};
    waitid(P_PID, static_cast<id_t>(_pid), &info, WEXITED | WNOHANG | WNOWAIT);
    const std::string number = std::to_string(info.si_status);
    return info.si_code == CLD_EXITED ? "exit status " + number
                                      : "signal " + number + " (" + strsignal(info.si_status) + ")";
}

void Call::End() {
    kill(-_pid, SIGTERM);
    _endWanted = true;
}
