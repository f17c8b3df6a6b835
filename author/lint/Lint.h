#pragma once

#include <author/lint/Paths.h>
#include <author/lint/SyntaxCheck.h>

namespace Author {

/// Looks for what is wrong with descriptors that are loaded together.
class Lint {
public:
    /// Reads a descriptor. Throws `Unreadable`.
    void Add(const std::string& file);
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
