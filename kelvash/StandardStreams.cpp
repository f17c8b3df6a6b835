#include "StandardStreams.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <iostream>
#include <streambuf>
#include <system_error>

namespace {

// Stands in front of the buffer of std::cout and remembers why it failed.
class OutputWatch : public std::streambuf {
public:
    void Install() { _target = std::cout.rdbuf(this); }

    // What is left in the buffers goes out here. 0 when everything has been written.
    int Finish() {
        errno = EIO;  // a stream that has failed by itself gives no reason
        Note(std::cout.flush().good());
        Note(std::fflush(stdout) == 0);
        std::cout.rdbuf(_target);
        return _error;
    }

protected:
    std::streamsize xsputn(const char* bytes, std::streamsize count) override {
        const std::streamsize written = _target->sputn(bytes, count);
        Note(written == count);
        return written;
    }
    int_type overflow(int_type c) override {
        const auto result = _target->sputc(traits_type::to_char_type(c));
        Note(!traits_type::eq_int_type(result, traits_type::eof()));
        return result;
    }
    int sync() override {
        const int result = _target->pubsync();
        Note(result == 0);
        return result;
    }

private:
    void Note(bool written) {
        if (!written && _error == 0) {
            _error = errno;
        }
    }

    std::streambuf* _target = nullptr;
    int _error = 0;
};

OutputWatch& Watch() {
    static OutputWatch watch;
    return watch;
}

void CheckStandardOutput() {
    const int error = Watch().Finish();
    if (error == 0) {
        return;
    }
    if (error != EPIPE) {
        std::cerr << "Errors: \nUnable to write to standard output: "
                  << std::generic_category().message(error) << std::endl;
    }
    _exit(EXIT_FAILURE);
}

}  // namespace

void FillClosedStreams() {
    for (int descriptor = STDIN_FILENO; descriptor <= STDERR_FILENO; ++descriptor) {
        if (fcntl(descriptor, F_GETFD) < 0) {
            // The lowest number that is free, which is this one.
            open("/dev/null", descriptor == STDIN_FILENO ? O_WRONLY : O_RDONLY);
        }
    }
}

void CheckStandardOutputAtExit() {
    Watch().Install();
    std::atexit(&CheckStandardOutput);
}
