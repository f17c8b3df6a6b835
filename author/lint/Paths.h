#pragma once

#include <author/lint/Report.h>

#include <map>

namespace Author {

/// The paths of all files that are looked at together, in the order in which they would be loaded.
class Paths {
public:
    /// Notes the namespaces and commands of a file.
    void Add(const xmlNode* root, const Report& report);
    /// What comes twice, and what stands below nothing.
    [[nodiscard]] std::vector<Finding> Check() const;

private:
    struct Entry {
        std::string path;
        std::string description;
        bool isCommand;
        std::string file;
        long line;
        bool mayComeAgain;   // by a comment
        bool mayLackParent;  // by a comment
    };
    void AddEntry(const xmlNode* node, bool isCommand, const Report& report);
    void CheckTwice(const Entry& entry, const Entry& first, std::vector<Finding>& findings) const;
    void CheckParent(const Entry& entry, size_t index, std::vector<Finding>& findings) const;

    std::vector<Entry> _entries;
    std::map<std::string, size_t> _first;  // by path
};

}  // namespace Author
