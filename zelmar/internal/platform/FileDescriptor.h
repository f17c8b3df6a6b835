#pragma once

#include <unistd.h>

#include <utility>

/// Owns a descriptor and closes it once. Never opened, given away or closed, it holds -1.
class FileDescriptor {
public:
    FileDescriptor() = default;
    explicit FileDescriptor(int descriptor) : _descriptor(descriptor) {}
    FileDescriptor(FileDescriptor&& other) noexcept
        : _descriptor(std::exchange(other._descriptor, -1)) {}
    FileDescriptor& operator=(FileDescriptor&& other) noexcept {
        std::swap(_descriptor, other._descriptor);
        return *this;
    }
    ~FileDescriptor() { Close(); }

    [[nodiscard]] int Get() const { return _descriptor; }

    void Close() {
        if (_descriptor >= 0) {
            close(std::exchange(_descriptor, -1));
        }
    }

private:
    int _descriptor = -1;
};
