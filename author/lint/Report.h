#pragma once

#include <author/lint/Xml.h>

#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace Author {

enum class Severity { Warning, Error };

struct Finding {
    std::string file;
    long line;
    Severity severity;
    std::string rule;
    std::string text;  ///< what will happen, and what to write instead
};

/// What is found in one file. A finding is left out when a comment ahead of its element, or of one
/// around it, allows its rule: <!-- lint: allow RULE: reason -->
class Report {
public:
    Report(std::string file, std::vector<Finding>& findings)
        : _file(std::move(file)), _findings(findings) {}

    void AddError(const xmlNode* place, std::string_view rule, std::string text) {
        Add(place, Severity::Error, rule, std::move(text));
    }
    void AddWarning(const xmlNode* place, std::string_view rule, std::string text) {
        Add(place, Severity::Warning, rule, std::move(text));
    }
    /// Where there is no element, and so no comment.
    void AddAt(long line, std::string_view rule, std::string text);

    [[nodiscard]] const std::string& GetFile() const { return _file; }
    /// Was an error found at the element or within it, allowed ones included?
    [[nodiscard]] bool HasErrorIn(const xmlNode* element) const {
        return _faulty.contains(element);
    }
    /// Complains of comments that look like permissions and are none.
    void CheckComments(const xmlNode* root);

    static bool IsAllowed(const xmlNode* place, std::string_view rule);

private:
    void Add(const xmlNode* place, Severity severity, std::string_view rule, std::string text);

    std::string _file;
    std::vector<Finding>& _findings;
    std::set<const xmlNode*> _faulty;  // with all elements around them
};

/// As compilers print them, each on a line: FILE:LINE: error|warning: TEXT [rule]
std::string AsLines(const std::vector<Finding>& findings);
/// An array of objects with the members file, line, severity, rule and text.
std::string AsJson(const std::vector<Finding>& findings);

}  // namespace Author
