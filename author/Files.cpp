#include <author/Files.h>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <set>

namespace Author {

namespace {

constexpr off_t largestFile = 16 * 1024 * 1024;

class FileDescriptor {
public:
    explicit FileDescriptor(int descriptor) : _descriptor(descriptor) {}
    FileDescriptor(const FileDescriptor&) = delete;
    FileDescriptor& operator=(const FileDescriptor&) = delete;
    ~FileDescriptor() {
        if (_descriptor >= 0) {
            close(_descriptor);
        }
    }
    [[nodiscard]] int Get() const { return _descriptor; }

private:
    int _descriptor;
};

[[noreturn]] void FailToRead(const std::string& path, const std::string& reason) {
    throw Unreadable("Unable to read " + path + ": " + reason);
}

}  // namespace

std::string ReadFile(const std::string& path) {
    const FileDescriptor file(open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC));
    struct stat status {};
    if (file.Get() < 0 || fstat(file.Get(), &status) != 0) {
        FailToRead(path, std::strerror(errno));
    }
    if (!S_ISREG(status.st_mode)) {
        FailToRead(path, "it is no regular file");
    }
    if (status.st_size > largestFile) {
        FailToRead(path, "it is larger than 16 MiB");
    }
    std::string text(static_cast<size_t>(status.st_size), '\0');
    size_t size = 0;
    while (size < text.size()) {
        const ssize_t count = read(file.Get(), text.data() + size, text.size() - size);
        if (count < 0 && errno == EINTR) {
            continue;
        }
        if (count < 0) {
            FailToRead(path, std::strerror(errno));
        }
        if (count == 0) {
            break;
        }
        size += static_cast<size_t>(count);
    }
    text.resize(size);
    return text;
}

std::vector<std::string> FilesAt(const std::string& path, const std::string& extension) {
    std::error_code error;
    if (!std::filesystem::is_directory(path, error)) {
        return {path};
    }
    std::set<std::string> files;
    for (const auto& entry : std::filesystem::directory_iterator(path, error)) {
        if (entry.path().extension() == extension) {
            files.insert(entry.path());
        }
    }
    if (error) {
        FailToRead(path, error.message());
    }
    if (files.empty()) {
        FailToRead(path, "there is no " + extension + " file in it");
    }
    return {files.begin(), files.end()};
}

}  // namespace Author
