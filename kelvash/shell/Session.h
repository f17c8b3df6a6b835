#pragma once

#include "History.h"
#include "LineEditor.h"
#include "TypedLine.h"

#include <zelmar/zelmar.h>

#include <string>
#include <vector>

namespace KelvashShell {

/// One person at a terminal: the namespace that they stand in, and the status of the last line.
class Session {
public:
    /// The dispatcher must outlive this.
    explicit Session(AutoCli::CliDispatcher& dispatcher);

    /// Reads and runs lines until one leaves; the status of the last one.
    int Run();

private:
    [[nodiscard]] LineEditor::Proposal Propose(const std::string& line) const;
    [[nodiscard]] AutoCli::Completion Complete(std::vector<std::string> words) const;
    [[nodiscard]] AutoCli::Completion CompleteUse(const std::vector<std::string>& words) const;
    void PrintChoice(const AutoCli::Completion& completion) const;

    bool RunLine(const std::string& line);
    void RunCommand(std::vector<std::string> words);
    void Use(const std::vector<std::string>& names);
    void Remember(const std::string& line, const std::vector<std::string>& words);

    [[nodiscard]] std::string Prompt() const;
    [[nodiscard]] Path Absolute(const std::vector<std::string>& names) const;
    [[nodiscard]] std::vector<std::string> InNamespace(std::vector<std::string> words) const;

    AutoCli::CliDispatcher& _dispatcher;
    Path _namespace;
    int _status = 0;
    History _history;
    LineEditor _editor;
};

}  // namespace KelvashShell
