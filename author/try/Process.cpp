#include <author/try/Process.h>

#include <fcntl.h>
#include <poll.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <string_view>
#include <system_error>
#include <vector>

namespace Author {

namespace {

using Clock = std::chrono::steady_clock;

constexpr size_t mostErrors = size_t{64} * 1024;
constexpr std::chrono::seconds patience{2};  // with what a process has left behind

volatile std::sig_atomic_t interrupted = 0;

void NoteInterrupt(int /*signal*/) {
    interrupted = 1;
}

[[noreturn]] void Fail(const char* what) {
    throw std::system_error(errno, std::generic_category(), what);
}

class Pipe {
public:
    Pipe() {
        if (pipe2(_ends, O_CLOEXEC) != 0) {
            Fail("Cannot open a pipe");
        }
    }
    Pipe(const Pipe&) = delete;
    Pipe& operator=(const Pipe&) = delete;
    ~Pipe() {
        CloseReading();
        CloseWriting();
    }
    [[nodiscard]] int Reading() const { return _ends[0]; }
    [[nodiscard]] int Writing() const { return _ends[1]; }
    void CloseReading() { Close(_ends[0]); }
    void CloseWriting() { Close(_ends[1]); }

private:
    static void Close(int& end) {
        if (end >= 0) {
            close(end);
        }
        end = -1;
    }
    int _ends[2];
};

// While it is there, Ctrl-C does not end this process, nor does a pipe that nobody reads.
class Signals {
public:
    Signals() {
        interrupted = 0;
        for (size_t i = 0; i < asked.size(); ++i) {
            struct sigaction action {};
            action.sa_handler = asked[i] == SIGPIPE ? SIG_IGN : NoteInterrupt;
            sigaction(asked[i], &action, &_before[i]);
        }
    }
    Signals(const Signals&) = delete;
    Signals& operator=(const Signals&) = delete;
    ~Signals() { Restore(); }
    void Restore() {
        for (size_t i = 0; i < asked.size(); ++i) {
            sigaction(asked[i], &_before[i], nullptr);
        }
    }

private:
    static constexpr std::array<int, 4> asked = {SIGINT, SIGTERM, SIGHUP, SIGPIPE};
    std::array<struct sigaction, asked.size()> _before{};
};

class ShellProcess {
public:
    ShellProcess(const std::string& line, const std::string& input) : _unwritten(input) {
        fcntl(_input.Writing(), F_SETFL, O_NONBLOCK);
        Feed();  // as the engine does: a short text need not be read
        _pid = fork();
        if (_pid < 0) {
            Fail("Cannot start a process");
        }
        if (_pid == 0) {
            Become(line.c_str());
        }
        setpgid(_pid, _pid);  // in both processes, for either may be first to need it
        _input.CloseReading();
        _output.CloseWriting();
        _errors.CloseWriting();
    }
    ShellProcess(const ShellProcess&) = delete;
    ShellProcess& operator=(const ShellProcess&) = delete;
    ~ShellProcess() {
        if (_pid > 0) {
            EndGroup();
        }
    }

    ShellRun Wait() {
        const auto start = Clock::now();
        while (_output.Reading() >= 0 || !HasEnded()) {
            Exchange();
            if (const ShellRun::End end = ReasonToEnd(); end != ShellRun::End::Itself) {
                _run.end = end;
                break;
            }
        }
        if (_errors.Reading() >= 0) {
            Drain(_errors, &ShellProcess::TakeErrors);
        }
        Collect();
        _run.time = Clock::now() - start;
        return std::move(_run);
    }

private:
    [[noreturn]] void Become(const char* line) {
        setpgid(0, 0);
        _signals.Restore();
        std::signal(SIGPIPE, SIG_DFL);
        dup2(_input.Reading(), STDIN_FILENO);
        dup2(_output.Writing(), STDOUT_FILENO);
        dup2(_errors.Writing(), STDERR_FILENO);
        execl("/bin/sh", "/bin/sh", "-c", line, nullptr);
        _exit(127);
    }

    // Does what is possible now, for a moment at the longest.
    void Exchange() {
        pollfd ends[] = {{_input.Writing(), POLLOUT, 0},
                         {_output.Reading(), POLLIN, 0},
                         {_errors.Reading(), POLLIN, 0}};
        if (poll(ends, std::size(ends), 20) <= 0) {
            return;
        }
        if (ends[0].revents != 0) {
            Feed();
        }
        if (ends[1].revents != 0) {
            Drain(_output, &ShellProcess::TakeOutput);
        }
        if (ends[2].revents != 0) {
            Drain(_errors, &ShellProcess::TakeErrors);
        }
    }

    void Feed() {
        if (!_unwritten.empty()) {
            const ssize_t count = write(_input.Writing(), _unwritten.data(), _unwritten.size());
            if (count < 0 && (errno == EAGAIN || errno == EINTR)) {
                return;
            }
            _run.inputLeft = count < 0;
            _unwritten.remove_prefix(count < 0 ? _unwritten.size() : static_cast<size_t>(count));
        }
        if (_unwritten.empty()) {
            _input.CloseWriting();
        }
    }

    void Drain(Pipe& pipe, void (ShellProcess::*take)(std::string_view)) {
        pollfd end = {pipe.Reading(), POLLIN, 0};
        if (poll(&end, 1, 0) != 1) {
            return;
        }
        const ssize_t count = read(pipe.Reading(), _block.data(), _block.size());
        if (count > 0) {
            (this->*take)({_block.data(), static_cast<size_t>(count)});
        } else if (count == 0 || errno != EINTR) {
            pipe.CloseReading();
        }
    }

    void TakeOutput(std::string_view text) { _run.output += text; }
    void TakeErrors(std::string_view text) {
        _run.errorBytes += text.size();
        _run.errors += text.substr(0, mostErrors - std::min(mostErrors, _run.errors.size()));
    }

    ShellRun::End ReasonToEnd() {
        if (interrupted != 0) {
            return ShellRun::End::Interrupted;
        }
        if (_run.output.size() > mostOutput) {
            return ShellRun::End::Floods;
        }
        if (HasEnded()) {
            _ended = std::min(_ended, Clock::now());
            return _output.Reading() >= 0 && Clock::now() - _ended > patience
                       ? ShellRun::End::LeavesOpen
                       : ShellRun::End::Itself;
        }
        siginfo_t info = {};
        const bool isStopped =
            waitid(P_PID, static_cast<id_t>(_pid), &info, WSTOPPED | WNOHANG | WNOWAIT) == 0 &&
            info.si_pid == _pid && (info.si_status == SIGTTIN || info.si_status == SIGTTOU);
        return isStopped ? ShellRun::End::ReadsTerminal : ShellRun::End::Itself;
    }

    // The process stays uncollected, so that nobody else becomes the leader of a group of its
    // number.
    [[nodiscard]] bool HasEnded() const {
        siginfo_t info = {};
        return waitid(P_PID, static_cast<id_t>(_pid), &info, WEXITED | WNOHANG | WNOWAIT) == 0 &&
               info.si_pid == _pid;
    }

    void EndGroup() {
        kill(-_pid, SIGKILL);
        while (waitpid(_pid, &_run.status, 0) < 0 && errno == EINTR) {
        }
        _pid = -1;
    }

    void Collect() {
        if (_run.end != ShellRun::End::Itself) {
            EndGroup();
            return;
        }
        while (waitpid(_pid, &_run.status, 0) < 0 && errno == EINTR) {
        }
        _pid = -1;
    }

    Signals _signals;
    Pipe _input, _output, _errors;
    std::string_view _unwritten;
    pid_t _pid = -1;
    Clock::time_point _ended = Clock::time_point::max();
    std::vector<char> _block = std::vector<char>(65536);
    ShellRun _run;
};

}  // namespace

ShellRun RunLine(const std::string& line, const std::string& input) {
    return ShellProcess(line, input).Wait();
}

}  // namespace Author
