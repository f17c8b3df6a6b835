#pragma once

#include <zelmar/internal/platform/FileDescriptor.h>

#include <sys/types.h>

#include <cstddef>

/// A pipe whose ends are close-on-exec and never among the descriptors 0, 1 and 2, also where the
/// process runs with some of those closed: what starts a child puts others in their places.
struct Pipe {
    FileDescriptor readEnd;
    FileDescriptor writeEnd;

    /// False, with the reason in `errno`, when there is no descriptor left.
    [[nodiscard]] bool Open();
};

/// `write` to a pipe that raises no signal when nobody reads the other end: it only fails, with
/// `EPIPE`. What the process has set for `SIGPIPE`, and one that was already waiting, stay as they
/// are.
[[nodiscard]] ssize_t WriteWithoutSignal(int descriptor, const char* bytes, size_t count);
