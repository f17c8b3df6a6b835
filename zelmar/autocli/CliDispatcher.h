#pragma once

#include <zelmar/autocli/Dispatcher.h>

#include <iosfwd>
#include <memory>
#include <string>

namespace AutoCli {

class OptionParser;

/// The dispatcher of a command-line tool: reads command lines, prints results and listings on
/// standard output and complaints on the error stream. A host constructs one, loads the plugins it
/// wants, and hands over argv.
class ZELMAR_EXPORT CliDispatcher : public Dispatcher {
public:
    CliDispatcher();
    ~CliDispatcher() override;

    /// Handles one command line, or with `--input` the lines of a stream, and ends the process with
    /// `exit`: status 0 when the call succeeded and 1 otherwise. What is not a matter of the call
    /// passes through to the host as an exception: `ZelmarException` for a path that leads nowhere
    /// and for a faulty declaration, and what a formatter throws.
    [[noreturn]] void HandleArgvInput(int argc, const char* const* argv);

    /// The same, for a host that goes on: gives the status, and throws nothing. Whatever is thrown
    /// is told on the error stream below "Errors: ", "Unknown error" where it is no standard
    /// exception. The second takes a line that is parsed already; `allowInput` tells whether
    /// `--input` may be heeded.
    int Run(int argc, const char* const* argv);
    int Run(OptionParser& parser, bool allowInput);

    /// Behind the errors of a line, `HandleOptions` and `Run` may print one more line that helps
    /// on, such as the nearest name to a mistyped one: where the error stream is a terminal, and
    /// unless it is turned off here.
    void SetHints(bool wanted) { _givesHints = wanted; }

    /// The formatter for commands that would print through another one; empty, as on a new
    /// dispatcher, for the command's own. `--formatter` wins. Help, listings and commands that
    /// print nothing by themselves stay as they are.
    void SetDefaultFormatter(std::string name) { _defaultFormatter = std::move(name); }

    /// Handles one parsed command line; true means success. Behind the usage text it ends the
    /// process with status 1.
    bool HandleOptions(OptionParser& parser, bool allowInput);
    /// Runs each line of a stream; the result is that of the last line that held words, and true
    /// when there was none. A stream that fails ends with "Unable to read the input: <reason>" on
    /// the error stream and false.
    bool ParseStreamInput(std::istream& stream);

    /// Acts on the options in front of the path. False when it printed the usage text.
    bool HandleDispatcherOptions(OptionParser& parser, FormatParameters& overrides,
                                 const std::shared_ptr<CallSpec::Output>& output);
    void ValidateDispatcherParameters(OptionParser& parser,
                                      const std::shared_ptr<CallSpec::Output>& output);

    /// Fills in the size of the terminal on standard output and, over its width, that of
    /// `--screen-width`, which holds for the later lines of this dispatcher too. On a terminal,
    /// control characters are to be shown, and columns counted where the locale is one of UTF-8.
    void GetDisplayContext(DisplayContext& context);
    /// The formatter "commandhelp", without parameters.
    FormatParameters GetHelpFormatParams();

    /// Prints the listing of a node's children.
    void PrintChildren(std::shared_ptr<NamespaceNode> node, std::shared_ptr<CommandOutput> output);
    /// Prints the messages, if there are any, on the error stream under "Errors: ", as
    /// `AutoCli_ErrorText` has them.
    void PrintError(const std::shared_ptr<CallSpec::Output>& output);

private:
    bool HandleInput(const OptionParser& parser);
    void HandleCommand(OptionParser& parser, Command& command, const FormatParameters& overrides,
                       DisplayContext& context, const std::shared_ptr<CommandOutput>& output);
    void PrintOutput(const std::shared_ptr<CommandInput>& input,
                     const std::shared_ptr<CommandOutput>& output,
                     const FormatParameters& overrides, DisplayContext& context);
    [[nodiscard]] std::string ChosenFormatter(const Command& command, const CallSpec::Input& input,
                                              const FormatParameters& overrides) const;
    void PrintHint(OptionParser& parser, bool isArgv);
    void PrintUsage() const;
    void LoadPlugins(const OptionParser& parser);

    std::string _dispatcherName;
    std::string _defaultFormatter;
    bool _givesHints = true;
    bool _runs = false;    // within `Run`, which does not end the process
    int _screenWidth = 0;  // what `--screen-width` said last; out of bounds it has no effect
};

}  // namespace AutoCli
