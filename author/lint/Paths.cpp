#include <author/lint/Paths.h>

namespace Author {

namespace {

Finding Error(const std::string& file, long line, const char* rule, std::string text) {
    return {file, line, Severity::Error, rule, std::move(text)};
}

}  // namespace

void Paths::AddEntry(const xmlNode* node, bool isCommand, const Report& report) {
    const std::string path = Attribute(node, "path");
    if (path.empty()) {
        return;
    }
    _first.try_emplace(path, _entries.size());
    _entries.push_back({path, Content(Child(node, "description")), isCommand, report.GetFile(),
                        xmlGetLineNo(node), Report::IsAllowed(node, "twice"),
                        Report::IsAllowed(node, "parent")});
}

// All namespaces of a file are registered before its commands.
void Paths::Add(const xmlNode* root, const Report& report) {
    for (const xmlNode* node : Children(Child(root, "namespaces"), "namespace")) {
        AddEntry(node, false, report);
    }
    for (const xmlNode* node : Children(Child(root, "commands"), "command")) {
        AddEntry(node, true, report);
    }
}

// Files may share a namespace at the top, with the same description.
void Paths::CheckTwice(const Entry& entry, const Entry& first,
                       std::vector<Finding>& findings) const {
    const bool isShared =
        !entry.isCommand && !first.isCommand && entry.path.find('.') == std::string::npos;
    if (entry.mayComeAgain || (isShared && entry.description == first.description)) {
        return;
    }
    const std::string place = first.file + ":" + std::to_string(first.line);
    findings.push_back(Error(entry.file, entry.line, "twice",
                             isShared
                                 ? "'" + entry.path + "' has another description at " + place +
                                       ", and the file that comes later is refused; write the same"
                                 : "'" + entry.path + "' is declared already at " + place +
                                       ", and the file that comes later is refused"));
}

void Paths::CheckParent(const Entry& entry, size_t index, std::vector<Finding>& findings) const {
    const size_t dot = entry.path.rfind('.');
    if (dot == std::string::npos || entry.mayLackParent) {
        return;
    }
    const std::string parent = entry.path.substr(0, dot);
    const auto found = _first.find(parent);
    if (found == _first.end()) {
        findings.push_back(Error(entry.file, entry.line, "parent",
                                 "no file here declares the namespace '" + parent + "' of '" +
                                     entry.path +
                                     "'; declare it, or look at the files "
                                     "that belong together in one run"));
        return;
    }
    const Entry& first = _entries[found->second];
    const std::string place = first.file + ":" + std::to_string(first.line);
    if (first.isCommand) {
        findings.push_back(Error(
            entry.file, entry.line, "parent",
            "'" + parent + "' at " + place + " is a command, and nothing can stand below it"));
    } else if (found->second > index) {
        findings.push_back(Error(entry.file, entry.line, "parent",
                                 "the namespace '" + parent + "' is declared later, at " + place +
                                     "; it must come first"));
    }
}

std::vector<Finding> Paths::Check() const {
    std::vector<Finding> findings;
    for (size_t i = 0; i < _entries.size(); ++i) {
        const size_t first = _first.at(_entries[i].path);
        if (first != i) {
            CheckTwice(_entries[i], _entries[first], findings);
        }
        CheckParent(_entries[i], i, findings);
    }
    return findings;
}

}  // namespace Author
