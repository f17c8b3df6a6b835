#include <author/lint/Rules.h>
#include <author/lint/ShellLine.h>

#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <filesystem>
#include <set>
#include <sstream>

namespace Author {

namespace {

bool IsBuiltIn(const std::string& word) {
    static const std::set<std::string> words = {
        "",        ".",        ":",      "[",     "alias",   "bg",    "break",  "cd",
        "command", "continue", "echo",   "eval",  "exec",    "exit",  "export", "false",
        "fg",      "getopts",  "hash",   "jobs",  "kill",    "local", "printf", "pwd",
        "read",    "readonly", "return", "set",   "shift",   "test",  "times",  "trap",
        "true",    "type",     "ulimit", "umask", "unalias", "unset", "wait"};
    return words.contains(word);
}

bool IsProgram(const std::filesystem::path& path) {
    std::error_code noError;
    return std::filesystem::is_regular_file(path, noError) && access(path.c_str(), X_OK) == 0;
}

bool IsOnPath(const std::string& word) {
    const char* path = std::getenv("PATH");
    std::istringstream folders(path ? path : "/usr/bin:/bin");
    for (std::string folder; std::getline(folders, folder, ':');) {
        if (IsProgram(std::filesystem::path(folder) / word)) {
            return true;
        }
    }
    return false;
}

// A relative path counts from the caller's folder; a script beside its descriptor is near enough.
std::string ProgramFault(const std::string& word, const std::string& descriptor) {
    const bool isPath = word.find('/') != std::string::npos;
    const bool isThere =
        isPath
            ? IsProgram(word) || IsProgram(std::filesystem::path(descriptor).parent_path() / word)
            : IsBuiltIn(word) || IsOnPath(word);
    if (isThere) {
        return "";
    }
    std::error_code noError;
    return isPath && std::filesystem::exists(word, noError)
               ? word + " cannot be executed; make it an executable file"
               : "there is no program " + word + " on this machine";
}

void CheckPrograms(const CheckedTemplate& checked, Report& report) {
    static std::map<std::pair<std::string, std::string>, std::string> known;
    std::set<std::string> told;
    for (const Expansion& expansion : checked.expansions) {
        for (const ShellWord& word : ReadShellLine(expansion.text).commands) {
            if (!word.isPlain || !told.insert(word.text).second) {
                continue;
            }
            const auto [fault, isNew] = known.try_emplace(
                {std::filesystem::path(report.GetFile()).parent_path(), word.text});
            if (isNew) {
                fault->second = ProgramFault(word.text, report.GetFile());
            }
            if (!fault->second.empty()) {
                report.AddWarning(checked.node, "program", fault->second);
            }
        }
    }
}

void AddSyntax(const CheckedTemplate& checked, const std::string& line, const std::string& text,
               Report& report, SyntaxCheck& syntax) {
    if (!Report::IsAllowed(checked.node, "syntax")) {
        syntax.Add(line,
                   {report.GetFile(), xmlGetLineNo(checked.node), Severity::Error, "syntax", text});
    }
}

}  // namespace

void CheckLine(const CheckedTemplate& checked, Report& report, SyntaxCheck& syntax) {
    const std::string trimmed = checked.text.substr(0, checked.text.find_last_not_of(" \t\n") + 1);
    if (trimmed.find('\n') != std::string::npos) {
        report.AddWarning(
            checked.node, "lines",
            "the line has several lines, and what the engine puts in front, such as "
            "LANG, reaches the first alone; write one line, and the rest in a script");
    }
    CheckPrograms(checked, report);
    for (const Expansion& expansion : checked.expansions) {
        if (expansion.text != expansion.expected || !expansion.left.empty()) {
            continue;  // other rules tell of what stands there
        }
        std::string options;
        for (const std::string& option : expansion.options) {
            options += " --" + option;
        }
        const std::string when = options.empty() ? "" : " with" + options;
        AddSyntax(checked, expansion.text, "the shell refuses the line" + when + ": ", report,
                  syntax);
        AddSyntax(checked, "LANG=en_US.UTF-8 " + expansion.text,
                  "where LANG is not set, the engine puts LANG=en_US.UTF-8 in front, and the shell "
                  "refuses the line" +
                      when + "; begin with a simple command: ",
                  report, syntax);
    }
}

}  // namespace Author
