#pragma once

#include <author/try/Process.h>
#include <author/try/Report.h>
#include <zelmar/zelmar.h>

namespace Author {

struct TrialOptions {
    bool stopsBeforeRun = false;
    bool printsBytes = false;  ///< on standard output; the report goes to the error stream
    std::string savedOutput;   ///< the file with a printed document; empty to run the command
};

/// One call of a command, step by step, as the engine makes it.
class Trial {
public:
    Trial(AutoCli::CliDispatcher& dispatcher, const TrialOptions& options)
        : _dispatcher(dispatcher), _options(options) {}

    /// The words as they stand behind the name of the tool. True when nothing is wrong. Throws
    /// `std::runtime_error` for a call that cannot be tried at all.
    bool Run(const std::vector<std::string>& words);

private:
    class Replay;

    void TakeInput(AutoCli::OptionParser& parser);
    void ShowInput();
    void RunLine();
    void Judge(const ShellRun& run);
    void ShowResult(const std::shared_ptr<AutoCli::CommandOutput>& output);
    [[nodiscard]] std::ostream& ReportStream() const;

    AutoCli::CliDispatcher& _dispatcher;
    const TrialOptions& _options;
    Secrets _secrets;
    TrialReport _report = TrialReport(ReportStream(), _secrets);
    std::shared_ptr<AutoCli::Command> _command;
    std::shared_ptr<AutoCli::ExtensionCommand> _extension;  // null for one of a shared object
    std::shared_ptr<AutoCli::CommandInput> _input;
    std::shared_ptr<AutoCli::CommandInput> _maskedInput;  // with dots for secrets
};

}  // namespace Author
