#pragma once

#include <chrono>
#include <iosfwd>
#include <string>
#include <vector>

namespace Host {

/// One line of the kernel's mount table.
struct Mount {
    std::string source;
    std::string path;
    std::string type;
    std::vector<std::string> options;
};

/// Reads a table in the form of /proc/self/mounts, where a blank in a name stands as "\040". A read
/// that fails ends it like the end of the table, and leaves the stream bad.
std::vector<Mount> ReadMounts(std::istream& table);

/// The sizes of a file system in MiB; all are 0 when there is an error.
struct Capacity {
    long size = 0;
    long used = 0;
    long available = 0;  ///< to users without privileges
    int error = 0;       ///< as in errno
};

Capacity MeasureMount(const char* path);

/// The capacity of each mount, in the same order. One that does not answer within `patience`, as
/// when the server behind it is gone, gets the error ETIMEDOUT, and one at which the process that
/// asks for it dies, EPIPE. Throws `std::system_error` when
/// the system is out of processes or descriptors.
std::vector<Capacity> MeasureMounts(const std::vector<Mount>& mounts,
                                    std::chrono::milliseconds patience,
                                    Capacity (*measure)(const char* path) = &MeasureMount);

}  // namespace Host
