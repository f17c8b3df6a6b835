#pragma once

#include <sys/types.h>

#include <filesystem>
#include <optional>
#include <string>
#include <vector>

namespace Host {

struct Process {
    pid_t number = 0;
    pid_t parent = 0;
    uid_t user = 0;
    std::string state;  ///< a word, such as "sleeping"
    long memory = 0;    ///< resident, in KiB; 0 for a thread of the kernel
    std::string name;   ///< as the kernel knows it: at most 15 bytes of a program's name
    std::string command;
};

/// Reads one process from its directory in /proc; nothing when it ended meanwhile. Control
/// characters of the name and of the command line become blanks, and a process without a command
/// line gets its name in brackets.
std::optional<Process> ReadProcess(const std::filesystem::path& directory);

/// Reads the processes of a directory like /proc, in the order of their numbers. Throws
/// `std::filesystem::filesystem_error` when it cannot be read.
std::vector<Process> ReadProcesses(const std::filesystem::path& table);

}  // namespace Host
