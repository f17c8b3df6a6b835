#pragma once

#include <author/lint/Paths.h>
#include <author/lint/SyntaxCheck.h>

#include <stdexcept>

namespace Author {

/// A file or folder that cannot be read, with the reason.
struct Unreadable : std::runtime_error {
    using std::runtime_error::runtime_error;
};

/// The descriptors that a path stands for: itself, or the .xml files of a folder in the order of
/// their names. Throws `Unreadable`.
std::vector<std::string> DescriptorsAt(const std::string& path);

/// Looks for what is wrong with descriptors that are loaded together.
class Lint {
public:
    /// A descriptor, or a folder, whose .xml files are looked at in the order of their names.
    /// Throws `Unreadable`.
    void Add(const std::string& path);
    /// All findings, by file in the order of their addition and by line. To be called once.
    std::vector<Finding> Finish();

private:
    void CheckDocument(xmlDoc* document, Report& report);
    void CheckCommand(const xmlNode* node, Report& report);

    std::vector<std::string> _files;
    std::vector<Finding> _findings;
    Paths _paths;
    SyntaxCheck _syntax;
};

}  // namespace Author
