#pragma once

#include <string>
#include <vector>

namespace KelvashShell {

/// The lines of earlier sessions, in a file of the user's: one a line, the oldest first. Each new
/// one is appended at once, so that sessions beside each other all leave theirs.
class History {
public:
    static constexpr size_t longest = 1000;  ///< lines

    /// The file of the user: $XDG_STATE_HOME/kelvash/history, or ~/.local/state for a variable
    /// that is not set. Without a home there is none.
    History();
    explicit History(std::string path) : _path(std::move(path)) {}

    /// The last lines of the file. A file that has grown to twice the length is shortened.
    std::vector<std::string> Load();
    void Append(const std::string& line);

    /// Why lines are not kept, in words; empty while all is well. From the first failure on nothing
    /// more is written.
    [[nodiscard]] const std::string& Complaint() const { return _complaint; }

private:
    [[nodiscard]] int Open(const std::string& path, int flags);
    void Shorten(const std::vector<std::string>& lines);
    void Fail();

    std::string _path;
    std::string _complaint;
};

}  // namespace KelvashShell
