#pragma once

#include <stdexcept>
#include <string>
#include <vector>

namespace Author {

/// A file or folder that cannot be read, with the reason.
struct Unreadable : std::runtime_error {
    using std::runtime_error::runtime_error;
};

/// The content of a file of at most 16 MiB that somebody may have written by hand: no pipe, which
/// would be waited for, and no device. Throws `Unreadable`.
std::string ReadFile(const std::string& path);

/// The files that a path stands for: itself, or those of a folder that end in `extension`, such as
/// ".xml", in the order of their names. Throws `Unreadable`, also when the folder has none.
std::vector<std::string> FilesAt(const std::string& path, const std::string& extension);

}  // namespace Author
