#include <author/test/Guarded.h>

#include <fcntl.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <system_error>

namespace Author {

namespace {

using Clock = std::chrono::steady_clock;

constexpr rlim_t largestFile = 256 * 1024 * 1024;

[[noreturn]] void FailWith(const char* what) {
    throw std::system_error(errno, std::generic_category(), what);
}

// Holds back, for its life, the signals that are waited for.
class HeldSignals {
public:
    HeldSignals() {
        std::signal(SIGCHLD, SIG_DFL);
        sigemptyset(&_held);
        for (const int number : {SIGINT, SIGTERM, SIGHUP, SIGCHLD}) {
            struct sigaction action {};
            if (sigaction(number, nullptr, &action) == 0 && action.sa_handler != SIG_IGN) {
                sigaddset(&_held, number);
            }
        }
        sigprocmask(SIG_BLOCK, &_held, &_before);
    }
    HeldSignals(const HeldSignals&) = delete;
    HeldSignals& operator=(const HeldSignals&) = delete;
    ~HeldSignals() { Release(); }
    void Release() const { sigprocmask(SIG_SETMASK, &_before, nullptr); }

    /// The next of them; 0 when the time is over.
    [[nodiscard]] int Wait(Clock::time_point end) const {
        const auto left = std::chrono::duration_cast<std::chrono::nanoseconds>(end - Clock::now());
        if (left.count() <= 0) {
            return 0;
        }
        const auto seconds = std::chrono::duration_cast<std::chrono::seconds>(left);
        const timespec time{seconds.count(), (left - seconds).count()};
        const int number = sigtimedwait(&_held, nullptr, &time);
        return number > 0 ? number : errno == EINTR ? SIGCHLD : 0;
    }

private:
    sigset_t _held{};
    sigset_t _before{};
};

// Orphans become children of this process, which asked for them, so that none is missed.
void EndChildren() {
    const std::string self = std::to_string(getpid());
    do {
        std::ifstream children("/proc/self/task/" + self + "/children");
        for (pid_t child = 0; children >> child;) {
            kill(child, SIGKILL);
        }
    } while (waitpid(-1, nullptr, 0) > 0 || errno == EINTR);
}

// What is thrown must not reach the caller, who runs in the other process.
[[noreturn]] void RunChild(const std::string& folder,
                           const std::function<int()>& function) noexcept {
    setsid();
    const rlimit size{largestFile, largestFile};
    const int nothing = open("/dev/null", O_RDONLY | O_CLOEXEC);
    if (chdir(folder.c_str()) != 0 || setrlimit(RLIMIT_FSIZE, &size) != 0 ||
        dup2(nothing, STDIN_FILENO) < 0 ||
        close_range(STDERR_FILENO + 1, ~0U, CLOSE_RANGE_CLOEXEC) != 0) {
        std::cerr << "zelmar: Unable to prepare a process: " << std::strerror(errno) << '\n';
        _exit(EXIT_FAILURE);
    }
    _exit(function());
}

}  // namespace

bool RunGuarded(const std::string& folder, std::chrono::seconds limit,
                const std::function<int()>& function) {
    const Clock::time_point end = Clock::now() + limit;
    prctl(PR_SET_CHILD_SUBREAPER, 1);
    std::cout.flush();
    const HeldSignals signals;
    const pid_t process = fork();
    if (process < 0) {
        FailWith("Unable to start a process");
    }
    if (process == 0) {
        signals.Release();
        RunChild(folder, function);
    }
    int number = SIGCHLD;
    bool hasEnded = false;
    while (number == SIGCHLD && !hasEnded) {
        number = signals.Wait(end);
        siginfo_t ended{};
        waitid(P_PID, static_cast<id_t>(process), &ended, WEXITED | WNOHANG | WNOWAIT);
        hasEnded = ended.si_pid == process;
    }
    kill(-process, SIGKILL);  // at once, before one of them can start another
    EndChildren();
    if (number != SIGCHLD && number != 0) {
        throw Interrupted(number, strsignal(number));
    }
    return hasEnded;
}

TemporaryFolder::TemporaryFolder()
    : _path(std::filesystem::temp_directory_path() / "zelmar-XXXXXX") {
    if (!mkdtemp(_path.data())) {
        FailWith("Unable to create a folder for files");
    }
}

TemporaryFolder::~TemporaryFolder() {
    std::error_code ignored;
    std::filesystem::remove_all(_path, ignored);
}

}  // namespace Author
