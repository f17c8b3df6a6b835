#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/ExtensionCommand.h>
#include <zelmar/autocli/extension/ShellCmd.h>
#include <zelmar/autocli/extension/XmlOutput.h>

#include <sys/wait.h>
#include <syslog.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <string_view>

using CallSpec::Input;
using CallSpec::InputSpec;
using CallSpec::Output;
using CallSpec::OutputSpec;
using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

// The code that a shell would show for the process.
int ExitCodeOf(int status) {
    constexpr int firstOfSignals = 128;
    return WIFSIGNALED(status) ? firstOfSignals + WTERMSIG(status) : WEXITSTATUS(status);
}

void ReportNoData(const std::string& commandLine, int status, Output& output) {
    // The first letter of "exited" is U+0435: log filters look for it.
    const std::string message =
        "Got no data from process.\nCommand \"" + commandLine +
        "\"\n\u0435xited with error code: " + std::to_string(ExitCodeOf(status));
    syslog(LOG_ERR, "%s", message.c_str());
    output.AddErrorMessage(message);
}

// The lines at the head of what a process printed that begin with "ERROR:".
void AddErrorLines(std::string_view printed, Output& output) {
    constexpr std::string_view mark = "ERROR:";
    while (printed.starts_with(mark)) {
        const std::string_view line = printed.substr(0, printed.find('\n'));
        output.AddErrorMessage(std::string(line.substr(mark.size())));
        printed.remove_prefix(std::min(line.size() + 1, printed.size()));
    }
}

void SetValue(std::string_view printed, int status, Output& output) {
    try {
        if (const auto value = XmlUtil_ParseXmlOutput(printed)) {
            output.SetRootObject(value);
        }
    } catch (const ZelmarException& error) {
        output.AddErrorMessage(std::string("Unable to parse output of Extension Command: ") +
                               error.what());
    }
    if (WIFSIGNALED(status) && !output.GetRootObject()) {
        const int signal = WTERMSIG(status);
        output.AddErrorMessage("The process of this command was ended by signal " +
                               std::to_string(signal) + " (" + strsignal(signal) + ")");
    }
}

}  // namespace

ExtensionCommand::~ExtensionCommand() = default;

std::shared_ptr<ExtensionCommand> ExtensionCommand::New() {
    return std::make_shared<ExtensionCommand>();
}

std::shared_ptr<InputSpec> ExtensionCommand::GetInputSpecInternal() {
    if (!_extensionInputSpec) {
        throw ZelmarException(
            "Request for NULL InputSpec.  Extension command is incomplete and will not work");
    }
    return _extensionInputSpec;
}

std::shared_ptr<OutputSpec> ExtensionCommand::GetOutputSpecInternal() {
    if (!_extensionOutputSpec) {
        throw ZelmarException(
            "Request for NULL OutputSpec.  Extension command is incomplete and will not work");
    }
    return _extensionOutputSpec;
}

void ExtensionCommand::ExecuteInternal(const std::shared_ptr<Input>& input,
                                       const std::shared_ptr<Output>& output) {
    const std::string commandLine = GetCommandLine(input);
    const std::string stdinText = SubstituteInput(input, true);
    std::string user;
    if (GetInputSpec()->IsContextSupported("user")) {
        user = input->GetContext("user");
    }

    std::string printed;
    const int status = AutoCli_ShellCmdWithOxUsername(commandLine, user, printed, stdinText);
    if (printed.empty()) {
        ReportNoData(commandLine, status, *output);
        return;
    }
    ReadPrinted(printed, status, *output);
}

std::string ExtensionCommand::GetCommandLine(const std::shared_ptr<Input>& input) {
    const bool hasLanguage = std::getenv("LANG") != nullptr;
    return (hasLanguage ? "" : "LANG=en_US.UTF-8 ") + SubstituteInput(input, false);
}

void ExtensionCommand::ReadPrinted(std::string_view printed, int status, Output& output) {
    AddErrorLines(printed, output);
    if (!output.HasError()) {
        SetValue(printed, status, output);
    }
}

}  // namespace AutoCli
