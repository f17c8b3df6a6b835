#include <author/lint/ShellLine.h>
#include <author/lint/SyntaxCheck.h>
#include <zelmar/zelmar.h>

#include <algorithm>

namespace Author {

namespace {

constexpr size_t largestBatch = 1000;

// The shell's complaint; empty for none.
std::string Complaint(const std::string& script) {
    std::string complaint;
    // What the shell has not read of its standard input is read to its end, for whoever writes it.
    const int status = AutoCli::AutoCli_ShellCmd(
        "/bin/sh -n 2>&1; status=$?; cat >/dev/null; exit $status", complaint, script);
    if (status == 0) {
        return "";
    }
    constexpr std::string_view mark = ": ";
    const size_t place = complaint.find("rror" + std::string(mark));
    complaint = place == std::string::npos ? complaint : complaint.substr(place + 6);
    complaint.erase(std::min(complaint.find('\n'), complaint.size()));
    return complaint.empty() ? "the shell fails" : complaint;
}

// Would a fault of this line be seen within its braces, and not be hidden by what follows?
bool StandsAlone(const std::string& line) {
    const ShellLine read = ReadShellLine(line);
    return read.isClosed && !read.hasHereDocument && !read.closesGroup && !line.ends_with('\\');
}

}  // namespace

void SyntaxCheck::Add(std::string line, Finding finding) {
    _units.push_back({std::move(line), std::move(finding)});
}

std::vector<Finding> SyntaxCheck::Run() {
    std::vector<Finding> findings;
    const auto others = std::stable_partition(
        _units.begin(), _units.end(), [](const Unit& unit) { return StandsAlone(unit.line); });
    const auto together = static_cast<size_t>(others - _units.begin());
    for (size_t begin = 0; begin < _units.size();) {
        const size_t end = begin < together ? std::min(begin + largestBatch, together) : begin + 1;
        Judge(begin, end, findings);
        begin = end;
    }
    _units.clear();
    return findings;
}

void SyntaxCheck::Judge(size_t begin, size_t end, std::vector<Finding>& findings) const {
    if (end - begin == 1) {
        const std::string complaint = Complaint(_units[begin].line);
        const Finding& finding = _units[begin].finding;
        const bool isKnown = std::ranges::any_of(findings, [&finding](const Finding& known) {
            return known.file == finding.file && known.line == finding.line;
        });
        if (!complaint.empty() && !isKnown) {
            findings.push_back(finding);
            findings.back().text += complaint;
        }
        return;
    }
    std::string script;
    for (size_t i = begin; i < end; ++i) {
        script += "{ " + _units[i].line + "\n}\n";
    }
    if (end - begin > 1 && !Complaint(script).empty()) {
        const size_t middle = begin + (end - begin) / 2;
        Judge(begin, middle, findings);
        Judge(middle, end, findings);
    }
}

}  // namespace Author
