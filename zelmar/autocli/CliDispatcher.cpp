#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/CliDispatcher.h>
#include <zelmar/autocli/Hints.h>
#include <zelmar/autocli/OptionParser.h>
#include <zelmar/autocli/formatters/BlockOutput.h>
#include <zelmar/autocli/formatters/CliDispatcherHelpFormatter.h>
#include <zelmar/autocli/formatters/Columns.h>
#include <zelmar/internal/Ascii.h>

#include <fcntl.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <ext/stdio_filebuf.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <iostream>
#include <string_view>
#include <system_error>
#include <utility>

using CallSpec::Input;
using CallSpec::Output;
using MetaObj::MetaList;
using MetaObj::MetaStruct;
using MetaObj::MetaType;
using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

constexpr std::array<std::string_view, 7> dispatcherOptions = {
    "h", "help", "formatter", "plugin-dir", "plugin", "format-param", "screen-width"};

constexpr int widestScreen = 9999;

// Ends a run where it would otherwise end the process.
struct UsagePrinted {};

bool IsKeyCharacter(char c) {
    return Ascii::IsAlnum(c) || std::string_view(" .-:").find(c) != std::string_view::npos;
}

// "<key>=<value>", where the key ends at the first equals sign.
bool SetFormatParameter(const std::string& text, FormatParameters& parameters) {
    const size_t equals = text.find('=');
    if (equals == std::string::npos || equals + 1 == text.size()) {
        return false;
    }
    std::string key = text.substr(0, equals);
    if (!Ascii::ConsistsOf(key, IsKeyCharacter)) {
        return false;
    }
    parameters.SetParameter(std::move(key), text.substr(equals + 1));
    return true;
}

void ChooseFormatter(const OptionParser& parser, FormatParameters& overrides, Output& output) {
    const auto names = parser.GetDispatcherParameter("formatter");
    if (names.size() > 1) {
        output.AddErrorMessage("Only one --formatter option can be passed to a command");
    } else if (names.size() == 1 && names.front().empty()) {
        output.AddErrorMessage(
            "--formatter requires the name of the formatter to use for this command");
    } else if (names.size() == 1) {
        overrides.SetFormatter(names.front());
    }
}

void TakeParseErrors(const OptionParser& parser, Output& output) {
    for (const std::string& error : parser.GetParseErrors()) {
        output.AddErrorMessage(error);
    }
}

// std::cin, which reads by way of stdin, takes a failure for the end.
bool HasFailed(const std::istream& stream) {
    return stream.bad() || (&stream == &std::cin && std::ferror(stdin) != 0);
}

const char* WordFor(NamespaceNodeType type) {
    switch (type) {
        case NodeTypeNamespace:
            return "Namespace";
        case NodeTypeCommand:
            return "Command";
        default:
            return "Unknown";
    }
}

std::shared_ptr<MetaList> ListOfNames(const std::list<std::string>& names) {
    auto list = MetaList::New(MetaType::String);
    list->Reserve(names.size());
    for (const std::string& name : names) {
        list->Add(name);
    }
    return list;
}

std::shared_ptr<MetaList> ListOfChildren(NamespaceNode& node) {
    const auto shape = MetaStruct::New("NamespaceNode");
    shape->SetField("Name", "");
    shape->SetField("Description", "");
    shape->SetField("Type", "");
    auto list = MetaList::New(MetaType::Struct, shape);
    for (const auto& child : node.GetNamespaceNodes()) {
        auto entry = MetaStruct::New(shape);
        entry->SetField("Name", child->GetName());
        entry->SetField("Description", child->GetDescription());
        entry->SetField("Type", WordFor(child->GetType()));
        list->Add(entry);
    }
    return list;
}

}  // namespace

CliDispatcher::CliDispatcher() = default;

CliDispatcher::~CliDispatcher() = default;

void CliDispatcher::HandleArgvInput(int argc, const char* const* argv) {
    OptionParser parser;
    parser.ParseArgv(argc, argv);
    std::exit(HandleOptions(parser, true) ? EXIT_SUCCESS : EXIT_FAILURE);
}

int CliDispatcher::Run(int argc, const char* const* argv) {
    OptionParser parser;
    parser.ParseArgv(argc, argv);
    return Run(parser, true);
}

int CliDispatcher::Run(OptionParser& parser, bool allowInput) {
    const auto complain = [](const char* message) {
        std::cerr << "Errors: \n" << AutoCli_ErrorText(message) << std::endl;
    };
    const bool ranBefore = std::exchange(_runs, true);
    int status = EXIT_FAILURE;
    try {
        status = HandleOptions(parser, allowInput) ? EXIT_SUCCESS : EXIT_FAILURE;
    } catch (const UsagePrinted&) {
        // which is no success
    } catch (const std::exception& error) {
        complain(error.what());
        PrintHint(parser, allowInput);
    } catch (...) {
        complain("Unknown error");
    }
    _runs = ranBefore;
    return status;
}

bool CliDispatcher::HandleOptions(OptionParser& parser, bool allowInput) {
    const auto output = CommandOutput::New();
    TakeParseErrors(parser, *output);
    if (output->HasError()) {
        PrintError(output);
        return false;
    }
    _dispatcherName = parser.GetDispatcher();
    FormatParameters overrides;
    if (!HandleDispatcherOptions(parser, overrides, output)) {
        if (_runs) {
            throw UsagePrinted();
        }
        std::exit(EXIT_FAILURE);
    }
    DisplayContext context;
    GetDisplayContext(context);
    if (allowInput && parser.HasDispatcherParameter("input")) {
        return HandleInput(parser);
    }
    std::list<std::string> path = parser.GetCommandPath();
    const auto node = GetRootNamespace()->ResolveNode(path);
    const auto command = std::dynamic_pointer_cast<Command>(node);
    if (command) {
        HandleCommand(parser, *command, overrides, context, output);
    } else {
        PrintChildren(node ? node : GetRootNamespace(), output);
    }
    PrintError(output);
    if (output->HasError()) {
        PrintHint(parser, allowInput);
    }
    return command && !output->HasError();
}

void CliDispatcher::PrintHint(OptionParser& parser, bool isArgv) {
    // With `--input`, the line that failed is one of the stream, and gone.
    if (!_givesHints || isatty(STDERR_FILENO) == 0 ||
        (isArgv && parser.HasDispatcherParameter("input"))) {
        return;
    }
    try {
        // A line of a stream or of a shell is typed without the name of the tool.
        const std::string tool = isArgv ? parser.GetDispatcher() + " " : "";
        const std::string hint = FindHint(*this, parser, tool, dispatcherOptions);
        if (!hint.empty()) {
            std::cerr << AutoCli_ErrorText(hint) << std::endl;
        }
    } catch (const std::exception&) {
        // A declaration that cannot be built has been told of.
    }
}

// What the line says beside `--input`, complaints about it included, does not reach the stream.
bool CliDispatcher::HandleInput(const OptionParser& parser) {
    const auto names = parser.GetDispatcherParameter("input");
    if (names.size() != 1) {
        std::cerr << "Only one --input dispatch parameter is allowed" << std::endl;
        return false;
    }
    const std::string& name = names.front();
    if (name == "STDIN") {
        return ParseStreamInput(std::cin);
    }
    // Not a std::ifstream, whose descriptor every child of a command would inherit.
    __gnu_cxx::stdio_filebuf<char> file(open(name.c_str(), O_RDONLY | O_CLOEXEC), std::ios::in);
    std::error_code noError;
    if (!file.is_open() || std::filesystem::is_directory(name, noError)) {
        std::cerr << "Unable to open file " << AutoCli_ErrorText(name) << std::endl;
        return false;
    }
    std::istream stream(&file);
    return ParseStreamInput(stream);
}

bool CliDispatcher::ParseStreamInput(std::istream& stream) {
    bool result = true;
    std::string line;
    errno = 0;
    // The half of a line that a failure leaves is no command.
    while (std::getline(stream, line) && !HasFailed(stream)) {
        OptionParser parser;
        if (!parser.ParseString(line)) {
            result = HandleOptions(parser, false);
        }
        errno = 0;
    }
    if (HasFailed(stream)) {
        std::cerr << "Unable to read the input: " << std::generic_category().message(errno)
                  << std::endl;
        return false;
    }
    return result;
}

void CliDispatcher::HandleCommand(OptionParser& parser, Command& command,
                                  const FormatParameters& overrides, DisplayContext& context,
                                  const std::shared_ptr<CommandOutput>& output) {
    const auto input = CommandInput::New();
    input->SetDispatcher(parser.GetDispatcher());
    input->SetCommandPath(parser.GetCommandPath());
    const auto spec = command.GetInputSpec();
    parser.SetInputSpec(spec);
    for (const auto& [name, value] : parser.GetCommandParameters()) {
        input->AddParameter(name, value);
    }
    TakeParseErrors(parser, *output);
    // Complaints about the dispatcher's options count here as well: the command does not run.
    if (output->HasError()) {
        return;
    }
    const std::string formatter = ChosenFormatter(command, *input, overrides);
    if (!formatter.empty() && !HasFormatter(formatter)) {
        // Nor does it for a result that nothing can print. A faulty input is told first.
        input->SetInputSpec(spec);
        if (spec->Validate(input, output)) {
            RequireFormatter(formatter, *output);
        }
    } else if (ExecuteCommand(input, output)) {
        PrintOutput(input, output, overrides, context);
    }
}

// What the line names; else, for a command that prints by itself, what the user has set for all.
std::string CliDispatcher::ChosenFormatter(const Command& command, const Input& input,
                                           const FormatParameters& overrides) const {
    const bool printsResult = !input.HasParameter("help") && !input.HasParameter("h") &&
                              !command.GetDefaultOutputFormatParameters().GetFormatter().empty();
    return overrides.GetFormatter().empty() && printsResult ? _defaultFormatter
                                                            : overrides.GetFormatter();
}

void CliDispatcher::PrintOutput(const std::shared_ptr<CommandInput>& input,
                                const std::shared_ptr<CommandOutput>& output,
                                const FormatParameters& overrides, DisplayContext& context) {
    FormatParameters format;
    if (output->GetOutputType() == Output::OutputTypeNormal) {
        format = GetDefaultOutputFormatParameters(input, output);
        if (!format.GetFormatter().empty() && !_defaultFormatter.empty()) {
            format.SetFormatter(_defaultFormatter);
        }
    } else if (output->GetOutputType() == Output::OutputTypeHelp) {
        format = GetHelpFormatParams();
    }
    format.OverrideValues(overrides);
    // Formatters change the flags of their stream; those of std::cout belong to all threads.
    std::ostream stream(std::cout.rdbuf());
    FormatOutput(output, format, context, stream);
    std::cout.setstate(stream.rdstate());
}

bool CliDispatcher::HandleDispatcherOptions(OptionParser& parser, FormatParameters& overrides,
                                            const std::shared_ptr<Output>& output) {
    ValidateDispatcherParameters(parser, output);
    if (parser.HasDispatcherParameter("h") || parser.HasDispatcherParameter("help")) {
        PrintUsage();
        return false;
    }
    if (const auto widths = parser.GetDispatcherParameter("screen-width"); !widths.empty()) {
        _screenWidth = static_cast<int>(std::strtol(widths.back().c_str(), nullptr, 0));
    }
    ChooseFormatter(parser, overrides, *output);
    LoadPlugins(parser);
    for (const std::string& parameter : parser.GetDispatcherParameter("format-param")) {
        if (!SetFormatParameter(parameter, overrides)) {
            output->AddErrorMessage("Unable to read format parameter " + parameter);
        }
    }
    return true;
}

void CliDispatcher::ValidateDispatcherParameters(OptionParser& parser,
                                                 const std::shared_ptr<Output>& output) {
    for (const auto& [name, value] : parser.GetDispatcherParameters()) {
        if (std::ranges::find(dispatcherOptions, name) == dispatcherOptions.end()) {
            output->AddErrorMessage("Unknown dispatcher parameter: " + name);
        }
    }
}

void CliDispatcher::LoadPlugins(const OptionParser& parser) {
    for (const std::string& directory : parser.GetDispatcherParameter("plugin-dir")) {
        if (!directory.empty()) {
            AddExternalDirectory(directory);
        }
    }
    for (const std::string& path : parser.GetDispatcherParameter("plugin")) {
        try {
            AddPlugin(path);
        } catch (const ZelmarException& error) {
            std::cerr << AutoCli_ErrorText("Unable to load plugin " + path + ": " + error.what())
                      << std::endl;
        }
    }
}

void CliDispatcher::PrintUsage() const {
    std::cout << _dispatcherName << " [dispatcher options] <namespaces> <command> [options]\n"
              << "      For a list of available namespaces run " << _dispatcherName
              << " with no arguments.  \n"
              << "      Objects can be listed by specifying just the namespace.\n"
                 "      Commands can be listed by specifying the namespace and object.\n"
                 "\n"
                 " Dispatcher Options: \n"
                 "       --plugin-dir                    Add all the plug-ins from this directory\n"
                 "       --plugin                        Add a specific file plugin.  (Multiple"
                 " --plugin options can be passed.)\n"
                 "       --formatter <formatter>         Override the formatter to use for a given"
                 " command\n"
                 "       --format-param <key>=<value>    Set a formatter parameter to give the"
                 " formatter information about how to format the command\n"
                 "       --screen-width <width>          Use the specified screen width when"
                 " formatting text\n"
                 "    -h|--help                          Show this message.\n"
              << std::endl;
}

void CliDispatcher::GetDisplayContext(DisplayContext& context) {
    winsize terminal = {};
    if (ioctl(STDOUT_FILENO, TIOCGWINSZ, &terminal) == 0) {
        context.screenWidth = terminal.ws_col;
        context.screenHeight = terminal.ws_row;
    }
    context.showControls = isatty(STDOUT_FILENO) == 1;
    context.countColumns = context.showControls && LocaleIsUtf8();
    if (_screenWidth >= 1 && _screenWidth <= widestScreen) {
        context.screenWidth = static_cast<uint16_t>(_screenWidth);
    }
}

FormatParameters CliDispatcher::GetHelpFormatParams() {
    FormatParameters parameters;
    parameters.SetFormatter("commandhelp");
    return parameters;
}

void CliDispatcher::PrintChildren(std::shared_ptr<NamespaceNode> node,
                                  std::shared_ptr<CommandOutput> output) {
    const auto page = MetaStruct::New("KelvashCommandPrint");
    page->SetField("Dispatcher", _dispatcherName);
    page->SetField("Path", ListOfNames(node->GetPath()));
    page->SetField("NamespaceNodes", ListOfChildren(*node));
    output->SetRootObject(page);
    FormatParameters parameters = GetHelpFormatParams();
    DisplayContext context;
    GetDisplayContext(context);
    BlockOutput blocks(std::cout);
    CliDispatcherHelpFormatter().Format(output, parameters, context, blocks);
}

void CliDispatcher::PrintError(const std::shared_ptr<Output>& output) {
    if (!output->HasError()) {
        return;
    }
    std::cerr << "Errors: " << std::endl;
    for (const std::string& error : output->GetErrors()) {
        std::cerr << AutoCli_ErrorText(error) << std::endl;
    }
}

}  // namespace AutoCli
