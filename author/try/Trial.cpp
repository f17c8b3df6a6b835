#include <author/Files.h>
#include <author/try/Judge.h>
#include <author/try/Trial.h>

#include <sys/wait.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <iostream>
#include <sstream>
#include <stdexcept>

using AutoCli::CommandInput;
using AutoCli::CommandOutput;

namespace Author {

namespace {

std::string SignalText(int signal) {
    return "signal " + std::to_string(signal) + " (" + strsignal(signal) + ")";
}

std::string EndText(const ShellRun& run) {
    if (run.end != ShellRun::End::Itself && run.end != ShellRun::End::LeavesOpen) {
        return "did not end by itself";
    }
    const int status = run.status;
    return WIFSIGNALED(status) ? "ended by " + SignalText(WTERMSIG(status))
                               : "status " + std::to_string(WEXITSTATUS(status));
}

std::string TimeText(const ShellRun& run) {
    char text[32];
    std::snprintf(text, sizeof text, "%.2f s", run.time.count());
    return text;
}

// What keeps the call from an end that says something about the document.
std::string Breakdown(const ShellRun& run) {
    switch (run.end) {
        case ShellRun::End::Interrupted:
            return "interrupted after " + TimeText(run) +
                   ": the command was ended with all processes of its group";
        case ShellRun::End::ReadsTerminal:
            return "the command reads the terminal, and was ended: nobody answers where kelvash is "
                   "called by a script; take a parameter, or read standard input";
        case ShellRun::End::Floods:
            return "the command printed more than 64 MiB, and was ended: kelvash holds all of it "
                   "in "
                   "memory";
        case ShellRun::End::LeavesOpen:
            return "the command ended, but something that it left in the background holds its "
                   "standard output, and kelvash waits for that; start it with >/dev/null 2>&1";
        case ShellRun::End::Itself:
            break;
    }
    return run.output.empty() ? "the command printed nothing, which is a failure whatever its "
                                "status; print a document, an empty list for no rows"
                              : "";
}

// What is wrong with an end by itself, beside the document.
std::vector<std::string> FaultsOfEnd(const ShellRun& run, bool hasValue) {
    constexpr int firstOfSignals = 128;
    std::vector<std::string> faults;
    const int code = WIFEXITED(run.status) ? WEXITSTATUS(run.status) : 0;
    if (WIFSIGNALED(run.status)) {
        faults.push_back("the command was ended by " + SignalText(WTERMSIG(run.status)));
    } else if (code > firstOfSignals && code < firstOfSignals + NSIG) {
        faults.push_back("status " + std::to_string(code) +
                         ": a process of the command was ended by " +
                         SignalText(code - firstOfSignals));
    }
    if (hasValue && code != 0) {
        faults.push_back("a whole document, and status " + std::to_string(code) +
                         ": kelvash shows it, and succeeds; print ERROR: lines for a failure");
    }
    if (hasValue && code == 0 && run.errorBytes > 0) {
        faults.push_back(
            "the error stream has text, and yet the command succeeds; if something failed, such as "
            "a producer in a pipe, print ERROR: lines");
    }
    if (run.inputLeft) {
        faults.push_back(
            "the command closes its standard input before it has read the text for it, on which "
            "kelvash fails");
    }
    return faults;
}

}  // namespace

std::ostream& Trial::ReportStream() const {
    return _options.printsBytes ? std::cerr : std::cout;
}

bool Trial::Run(const std::vector<std::string>& words) {
    AutoCli::OptionParser parser("kelvash");
    parser.ParseVector(words);
    std::list<std::string> path = parser.GetCommandPath();
    _command = std::dynamic_pointer_cast<AutoCli::Command>(
        _dispatcher.GetRootNamespace()->ResolveNode(path));
    if (!_command) {
        throw std::runtime_error("A namespace cannot be tried; name a command in it");
    }
    _extension = std::dynamic_pointer_cast<AutoCli::ExtensionCommand>(_command);
    if (!_options.savedOutput.empty()) {
        _input = CommandInput::New();
        ShellRun saved;
        saved.output = ReadFile(_options.savedOutput);
        Judge(saved);
        return _report.Found() == 0;
    }
    TakeInput(parser);
    if (_report.Found() == 0) {
        ShowInput();
    }
    if (_report.Found() == 0 && !_options.stopsBeforeRun) {
        if (_extension) {
            RunLine();
        } else {
            const auto output = CommandOutput::New();
            _command->Execute(_input, output);
            ShowResult(output);
        }
    }
    return _report.Found() == 0;
}

// As the dispatcher does, up to the point where the command runs.
void Trial::TakeInput(AutoCli::OptionParser& parser) {
    const auto spec = _command->GetInputSpec();
    parser.SetInputSpec(spec);
    const auto output = CommandOutput::New();
    _input = CommandInput::New();
    _maskedInput = CommandInput::New();
    for (const auto& [name, value] : parser.GetCommandParameters()) {
        _input->AddParameter(name, value);
    }
    _input->SetCommandPath(parser.GetCommandPath());
    _input->SetInputSpec(spec);
    _maskedInput->SetInputSpec(spec);
    for (const auto& [name, values] : _input->GetParameters()) {
        const auto* parameter = spec->FindParameterSpec(name);
        const bool isSecret = parameter && parameter->IsSecret();
        for (const std::string& value : values) {
            if (isSecret) {
                _secrets.Add(value);
            }
            _maskedInput->AddParameter(name, isSecret ? Secrets::dots : value);
        }
    }
    if (_input->HasParameter("help")) {
        throw std::runtime_error("With --help the command is not run; leave it out");
    }
    for (const std::string& error : parser.GetParseErrors()) {
        output->AddErrorMessage(error);
    }
    if (!output->HasError()) {
        spec->Validate(_input, output);
    }
    _report.Findings("refused", output->GetErrors(), output->GetErrors().size());
}

void Trial::ShowInput() {
    std::string values;
    for (const auto& [name, given] : _maskedInput->GetParameters()) {
        for (const std::string& value : given) {
            values += "--" + name + (value.empty() ? "" : " " + value) + "\n";
        }
    }
    _report.Section("parameters", values);
    if (!_extension) {
        _report.Section("command line", "none: the command is code of a shared object");
        return;
    }
    _report.Section("command line", _extension->SubstituteInput(_maskedInput, false));
    _report.Section("standard input", _extension->SubstituteInput(_maskedInput, true));
    if (!std::getenv("LANG")) {
        _report.Section("environment", "LANG=en_US.UTF-8, put in front of the line");
    }
    if (_command->GetInputSpec()->IsContextSupported("user")) {
        _report.Section("environment", "OX_USERNAME, where a host sets the user");
    }
}

void Trial::RunLine() {
    const ShellRun run = Author::RunLine(_extension->GetCommandLine(_input),
                                         _extension->SubstituteInput(_input, true));
    _report.Section("run", EndText(run) + "\n" + TimeText(run) + "\n" +
                               std::to_string(run.output.size()) + " bytes on standard output, " +
                               std::to_string(run.errorBytes) + " on the error stream\n");
    _report.Section("error stream", run.errors);
    if (_options.printsBytes) {
        std::cout << run.output << std::flush;
    }
    const std::string breakdown = Breakdown(run);
    if (breakdown.empty()) {
        Judge(run);
        return;
    }
    std::vector<std::string> lines =
        run.end == ShellRun::End::Itself ? FaultsOfEnd(run, false) : std::vector<std::string>();
    lines.push_back(breakdown);
    _report.Findings("findings", lines, lines.size());
}

// Printed bytes in the frame that the engine has around the work of every command.
class Trial::Replay : public AutoCli::Command {
public:
    Replay(AutoCli::Command& command, const ShellRun& run) : _command(command), _run(run) {}

    std::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal() override {
        return _command.GetInputSpec();
    }
    std::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal() override {
        return _command.GetOutputSpecInternal();
    }
    void ExecuteInternal(const std::shared_ptr<CallSpec::Input>& /*input*/,
                         const std::shared_ptr<CallSpec::Output>& output) override {
        AutoCli::ExtensionCommand::ReadPrinted(_run.output, _run.status, *output);
    }

private:
    AutoCli::Command& _command;
    const ShellRun& _run;
};

void Trial::Judge(const ShellRun& run) {
    const auto output = CommandOutput::New();
    {
        const QuietXml quiet;
        Replay(*_command, run).Execute(_input, output);
    }
    Faults faults = JudgePrinted(run.output, _command->GetOutputSpec()->GetRootObject().get());
    std::vector<std::string> lines = FaultsOfEnd(run, output->GetRootObject() != nullptr);
    faults.count += lines.size();
    for (const auto& [line, text] : faults.kept) {
        lines.push_back("line " + std::to_string(line) + ": " + text);
    }
    _report.Findings("findings", lines, faults.count);
    ShowResult(output);
}

void Trial::ShowResult(const std::shared_ptr<CommandOutput>& output) {
    if (output->HasError()) {
        _report.Findings("errors", output->GetErrors(), output->GetErrors().size());
        return;
    }
    auto format = _command->GetDefaultOutputFormatParameters();
    AutoCli::DisplayContext context;
    std::ostringstream result;
    if (_dispatcher.FormatOutput(output, format, context, result)) {
        _report.Section("result", result.str());
    } else {
        _report.Findings("errors", output->GetErrors(), output->GetErrors().size());
    }
}

}  // namespace Author
