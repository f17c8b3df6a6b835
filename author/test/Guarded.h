#pragma once

#include <chrono>
#include <functional>
#include <stdexcept>
#include <string>

namespace Author {

/// The user, or the system, asked the program to end while others ran for it.
struct Interrupted : std::runtime_error {
    Interrupted(int number, const std::string& text) : std::runtime_error(text), signal(number) {}
    int signal;
};

/// Runs a function in a process and a session of their own, without a terminal and with an empty
/// standard input, in the folder `folder`. What it returns is the status of the process, which may
/// become another program by `execve`, too. No file can become larger than 256 MiB.
///
/// When the process has ended, or the time is over, all processes that it started end, wherever
/// they went. True when it ended by itself. An interrupt (Ctrl-C), a hangup or a request to
/// terminate that reaches this process ends them as well and throws `Interrupted`. Throws
/// `std::system_error` when no process can be started.
bool RunGuarded(const std::string& folder, std::chrono::seconds limit,
                const std::function<int()>& function);

/// An empty folder of this process alone, which goes with all that is in it.
class TemporaryFolder {
public:
    TemporaryFolder();
    TemporaryFolder(const TemporaryFolder&) = delete;
    TemporaryFolder& operator=(const TemporaryFolder&) = delete;
    ~TemporaryFolder();
    [[nodiscard]] const std::string& GetPath() const { return _path; }

private:
    std::string _path;
};

}  // namespace Author
