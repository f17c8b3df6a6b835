#include "History.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <sstream>
#include <system_error>

namespace KelvashShell {

namespace {

constexpr size_t longestLine = 65536;  // bytes; more than a person types

std::string FileOfUser() {
    const char* state = secure_getenv("XDG_STATE_HOME");
    if (state && *state == '/') {
        return std::string(state) + "/kelvash/history";
    }
    const char* home = secure_getenv("HOME");
    return home && *home == '/' ? std::string(home) + "/.local/state/kelvash/history" : "";
}

// As a state directory is made: for the user alone.
void MakeFolders(const std::filesystem::path& folder) {
    std::error_code error;
    if (folder.has_parent_path() && !std::filesystem::exists(folder, error)) {
        MakeFolders(folder.parent_path());
        mkdir(folder.c_str(), S_IRWXU);
    }
}

std::string ReadAll(int descriptor) {
    std::string text;
    char block[4096];
    ssize_t count = 0;
    while ((count = read(descriptor, block, sizeof block)) > 0) {
        text.append(block, static_cast<size_t>(count));
    }
    return text;
}

bool WriteAll(int descriptor, const std::string& text) {
    return write(descriptor, text.data(), text.size()) == static_cast<ssize_t>(text.size());
}

}  // namespace

History::History() : History(FileOfUser()) {
    if (!_path.empty()) {
        MakeFolders(std::filesystem::path(_path).parent_path());
    }
}

std::vector<std::string> History::Load() {
    std::vector<std::string> lines;
    const int file = Open(_path, O_RDONLY | O_CREAT);
    if (file < 0) {
        return lines;
    }
    const std::string content = ReadAll(file);
    close(file);
    if (!content.empty() && !content.ends_with('\n')) {
        Append("");  // ends a line that a session could write by half only
    }
    std::istringstream text(content);
    for (std::string line; std::getline(text, line);) {
        // What a broken file may hold and no line can.
        if (!line.empty() && line.find('\0') == std::string::npos) {
            lines.push_back(line);
        }
    }
    const bool isLong = lines.size() >= 2 * longest;
    if (lines.size() > longest) {
        lines.erase(lines.begin(), lines.end() - static_cast<long>(longest));
    }
    if (isLong) {
        Shorten(lines);
    }
    return lines;
}

void History::Append(const std::string& line) {
    const int file = line.size() > longestLine ? -1 : Open(_path, O_WRONLY | O_APPEND | O_CREAT);
    if (file < 0) {
        return;
    }
    if (!WriteAll(file, line + "\n")) {  // one write, so that no other session comes between
        Fail();
    }
    close(file);
}

// No pipe to wait for, and nobody else may read it, whoever has made it.
int History::Open(const std::string& path, int flags) {
    if (path.empty() || !_complaint.empty()) {
        return -1;
    }
    const int file = open(path.c_str(), flags | O_CLOEXEC | O_NONBLOCK, S_IRUSR | S_IWUSR);
    struct stat status = {};
    if (file < 0 || fstat(file, &status) != 0) {
        Fail();
        return -1;
    }
    if (!S_ISREG(status.st_mode)) {
        close(file);
        errno = S_ISDIR(status.st_mode) ? EISDIR : EINVAL;
        Fail();
        return -1;
    }
    fchmod(file, S_IRUSR | S_IWUSR);
    return file;
}

void History::Shorten(const std::vector<std::string>& lines) {
    const std::string fresh = _path + ".new";
    const int file = Open(fresh, O_WRONLY | O_CREAT | O_TRUNC);
    if (file < 0) {
        return;
    }
    std::string text;
    for (const std::string& line : lines) {
        text += line + "\n";
    }
    if (!WriteAll(file, text) || rename(fresh.c_str(), _path.c_str()) != 0) {
        Fail();
    }
    close(file);
}

void History::Fail() {
    _complaint =
        "The history is not kept: " + _path + ": " + std::generic_category().message(errno);
}

}  // namespace KelvashShell
