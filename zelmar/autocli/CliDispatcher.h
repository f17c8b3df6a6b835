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

    /// Handles one parsed command line; true means success. Ends the process with status 1 behind
    /// the usage text. `allowInput` tells whether `--input` may be heeded.
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
    /// `--screen-width`, which holds for the later lines of this dispatcher too.
    void GetDisplayContext(DisplayContext& context);
    /// The formatter "commandhelp", without parameters.
    FormatParameters GetHelpFormatParams();

    /// Prints the listing of a node's children.
    void PrintChildren(std::shared_ptr<NamespaceNode> node, std::shared_ptr<CommandOutput> output);
    /// Prints the messages, if there are any, on the error stream under "Errors: ".
    void PrintError(const std::shared_ptr<CallSpec::Output>& output);

private:
    bool HandleInput(const OptionParser& parser);
    void HandleCommand(OptionParser& parser, Command& command, const FormatParameters& overrides,
                       DisplayContext& context, const std::shared_ptr<CommandOutput>& output);
    void PrintOutput(const std::shared_ptr<CommandInput>& input,
                     const std::shared_ptr<CommandOutput>& output,
                     const FormatParameters& overrides, DisplayContext& context);
    void PrintUsage() const;
    void LoadPlugins(const OptionParser& parser);

    std::string _dispatcherName;
    int _screenWidth = 0;  // what `--screen-width` said last; out of bounds it has no effect
};

}  // namespace AutoCli
