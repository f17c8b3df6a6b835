#include <zelmar/internal/platform/Pipe.h>

#include <fcntl.h>

#include <cerrno>
#include <csignal>
#include <ctime>

namespace {

FileDescriptor AboveStandardOnes(FileDescriptor descriptor) {
    constexpr int lowest = 3;
    if (descriptor.Get() >= lowest) {
        return descriptor;
    }
    return FileDescriptor(fcntl(descriptor.Get(), F_DUPFD_CLOEXEC, lowest));
}

bool IsPending(int signal) {
    sigset_t pending;
    sigpending(&pending);
    return sigismember(&pending, signal) == 1;
}

}  // namespace

bool Pipe::Open() {
    int ends[2];
    if (pipe2(ends, O_CLOEXEC) != 0) {
        return false;
    }
    readEnd = FileDescriptor(ends[0]);
    writeEnd = FileDescriptor(ends[1]);
    readEnd = AboveStandardOnes(std::move(readEnd));
    writeEnd = AboveStandardOnes(std::move(writeEnd));
    return readEnd.Get() >= 0 && writeEnd.Get() >= 0;
}

// The signal of a failed write is sent to the writing thread, before `write` returns. So it is held
// back in this thread alone, and taken away again unless one was waiting before: the two are one.
ssize_t WriteWithoutSignal(int descriptor, const char* bytes, size_t count) {
    sigset_t brokenPipe;
    sigset_t before;
    sigemptyset(&brokenPipe);
    sigaddset(&brokenPipe, SIGPIPE);
    pthread_sigmask(SIG_BLOCK, &brokenPipe, &before);
    const bool wasPending = IsPending(SIGPIPE);

    const ssize_t written = write(descriptor, bytes, count);
    const int error = errno;
    if (written < 0 && error == EPIPE && !wasPending) {
        const timespec atOnce = {};
        sigtimedwait(&brokenPipe, nullptr, &atOnce);
    }
    pthread_sigmask(SIG_SETMASK, &before, nullptr);
    errno = error;
    return written;
}
