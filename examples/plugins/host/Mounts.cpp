#include "Mounts.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/statvfs.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <istream>
#include <sstream>
#include <system_error>
#include <thread>

namespace Host {

namespace {

using std::chrono::milliseconds;

// Turns "\040" and the like, a backslash and three octal digits, into the byte.
std::string Decode(const std::string& text) {
    std::string decoded;
    for (size_t at = 0; at < text.size(); ++at) {
        if (text[at] == '\\' && at + 3 < text.size()) {
            decoded += static_cast<char>(std::strtol(text.substr(at + 1, 3).c_str(), nullptr, 8));
            at += 3;
        } else {
            decoded += text[at];
        }
    }
    return decoded;
}

std::string NextWord(std::istream& line) {
    std::string word;
    std::getline(line, word, ' ');
    return Decode(word);
}

std::vector<std::string> SplitAtCommas(const std::string& text) {
    std::vector<std::string> parts;
    std::istringstream stream(text);
    for (std::string part; std::getline(stream, part, ',');) {
        parts.push_back(part);
    }
    return parts;
}

// A child process that measures mounts one after the other and sends each capacity through a pipe.
// Asking a dead server for the size of its file system can block for ever: that must happen to the
// child and not to the caller.
class Surveyor {
public:
    Surveyor(const Mount* begin, const Mount* end, Capacity (*measure)(const char*)) {
        int ends[2];
        if (pipe2(ends, O_CLOEXEC) != 0) {
            throw std::system_error(errno, std::generic_category(), "Unable to make a pipe");
        }
        _answers = ends[0];
        _child = fork();
        const int error = errno;
        if (_child == 0) {
            Survey(ends[1], begin, end, measure);
        }
        close(ends[1]);
        if (_child < 0) {
            close(_answers);
            throw std::system_error(error, std::generic_category(), "Unable to start a process");
        }
    }

    Surveyor(const Surveyor&) = delete;
    Surveyor& operator=(const Surveyor&) = delete;

    // A child that not even the kernel can end at once is left behind.
    ~Surveyor() {
        close(_answers);
        kill(_child, SIGKILL);
        for (int tries = 0; tries < 100 && waitpid(_child, nullptr, WNOHANG) == 0; ++tries) {
            std::this_thread::sleep_for(milliseconds(1));
        }
    }

    // The next capacity. False when the child sent none; its error then tells why.
    bool Receive(Capacity& capacity, milliseconds patience) const {
        pollfd answers = {_answers, POLLIN, 0};
        int ready = -1;
        do {
            ready = poll(&answers, 1, static_cast<int>(patience.count()));
        } while (ready < 0 && errno == EINTR);
        const ssize_t count = ready > 0 ? read(_answers, &capacity, sizeof capacity) : ready;
        if (count == sizeof capacity) {
            return true;
        }
        capacity = {.error = count < 0 ? errno : ready == 0 ? ETIMEDOUT : EPIPE};
        return false;
    }

private:
    [[noreturn]] static void Survey(int pipe, const Mount* begin, const Mount* end,
                                    Capacity (*measure)(const char*)) {
        // Nothing but the pipe stays open: nobody shall wait for a stuck child to close the rest.
        dup2(pipe, STDIN_FILENO);
        close_range(STDIN_FILENO + 1, ~0U, 0);
        for (const Mount* mount = begin; mount != end; ++mount) {
            const Capacity capacity = measure(mount->path.c_str());
            if (write(STDIN_FILENO, &capacity, sizeof capacity) != sizeof capacity) {
                break;
            }
        }
        _exit(0);
    }

    int _answers = -1;
    pid_t _child = -1;
};

}  // namespace

std::vector<Mount> ReadMounts(std::istream& table) {
    std::vector<Mount> mounts;
    for (std::string text; std::getline(table, text);) {
        std::istringstream line(text);
        Mount mount;
        mount.source = NextWord(line);
        mount.path = NextWord(line);
        mount.type = NextWord(line);
        mount.options = SplitAtCommas(NextWord(line));
        mounts.push_back(std::move(mount));
    }
    return mounts;
}

Capacity MeasureMount(const char* path) {
    struct statvfs answer = {};
    if (statvfs(path, &answer) != 0) {
        return {.error = errno};
    }
    const auto inMebibytes = [&](fsblkcnt_t blocks) {
        return static_cast<long>(blocks * answer.f_frsize >> 20);
    };
    return {inMebibytes(answer.f_blocks), inMebibytes(answer.f_blocks - answer.f_bfree),
            inMebibytes(answer.f_bavail)};
}

std::vector<Capacity> MeasureMounts(const std::vector<Mount>& mounts, milliseconds patience,
                                    Capacity (*measure)(const char* path)) {
    std::vector<Capacity> capacities;
    const Mount* const end = mounts.data() + mounts.size();
    while (capacities.size() < mounts.size()) {
        // Each further child goes on behind the mount on which the one before it got stuck.
        const Surveyor surveyor(mounts.data() + capacities.size(), end, measure);
        bool answers = true;
        while (answers && capacities.size() < mounts.size()) {
            answers = surveyor.Receive(capacities.emplace_back(), patience);
        }
    }
    return capacities;
}

}  // namespace Host
