#pragma once

#include <author/lint/Report.h>

namespace Author {

/// Lets `/bin/sh -n` read lines, which runs nothing. Many of them are read at once, so that a
/// thousand cost a few processes; only when that fails they are taken apart.
class SyntaxCheck {
public:
    /// When the shell refuses the line, the finding gets its words behind its text. Of the lines
    /// that are added under one finding's file, line and rule, the first refused one counts.
    void Add(std::string line, Finding finding);

    /// The findings on the lines that were refused.
    std::vector<Finding> Run();

private:
    struct Unit {
        std::string line;
        Finding finding;
    };
    void Judge(size_t begin, size_t end, std::vector<Finding>& findings) const;

    std::vector<Unit> _units;
};

}  // namespace Author
