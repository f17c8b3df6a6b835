#pragma once

#include <zelmar/autocli/Command.h>

#include <memory>
#include <string>
#include <string_view>
#include <utility>

namespace AutoCli {

/// A command without code of its own. Its work is a line for `/bin/sh`, made from a template and
/// the parameters of the call; the process prints its result as XML, or lines that begin with
/// "ERROR:". A second template makes the text for the process's standard input.
///
/// Templates are text in which these forms are replaced, one parameter after the other by name:
///
///     $val{name}                     the value
///     $if{name,body}                 the body when the parameter was given, else nothing
///     $list{name,'c',quote}          the values, joined by c, one character or none
///     $multilist{name,prefix,quote}  each value, behind a blank, the prefix and a blank
///
/// `quote` is true or false: with double quotes or without. In the line, values are protected from
/// the shell; in the standard input they stand as they are. A form of a parameter that was not
/// given stays, except `$if`. There is no parser: a body ends at the first `}` behind its first
/// character, and a value can spell a form of a parameter that comes later.
class ZELMAR_EXPORT ExtensionCommand : public Command {
public:
    ExtensionCommand() = default;
    ~ExtensionCommand() override;

    static std::shared_ptr<ExtensionCommand> New();

    void SetExecuteCommand(const std::string& command) { _executeCommand = command; }
    void SetStdin(const std::string& text) { _stdin = text; }
    void SetInputSpec(const std::shared_ptr<CallSpec::InputSpec>& spec) {
        _extensionInputSpec = spec;
    }
    void SetOutputSpec(const std::shared_ptr<CallSpec::OutputSpec>& spec) {
        _extensionOutputSpec = spec;
    }

    /// Throw `ZelmarException` until one was set: "Request for NULL InputSpec.  Extension command
    /// is incomplete and will not work", and the same with OutputSpec.
    std::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal() override;
    std::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal() override;

    /// Runs the process and waits for it, without a time limit. What it prints becomes the value of
    /// the output or its messages; its exit code decides nothing. A process that prints nothing has
    /// failed: the message for it, which also goes to syslog, shows the whole line with the values
    /// of all parameters. Throws `ZelmarException` as `SubstituteInput` and `AutoCli_ShellCmd` do.
    void ExecuteInternal(const std::shared_ptr<CallSpec::Input>& input,
                         const std::shared_ptr<CallSpec::Output>& output) override;

    /// The template of the command line, or that of the standard input, with its forms replaced.
    /// NUL bytes, which no process can be given in a line, are left out. Throws what
    /// `Input::GetParameter` throws when the template reads a flag or a list with `$val`. Time is
    /// linear in the text for each parameter that was given.
    std::string SubstituteInput(const std::shared_ptr<CallSpec::Input>& input, bool isStdin);

    /// The line that `ExecuteInternal` hands to `AutoCli_ShellCmd`: the template of the command
    /// line, expanded, behind `LANG=en_US.UTF-8` where the environment has no `LANG`. With
    /// `ReadPrinted`, for a tool that runs the line in its own way. Throws as `SubstituteInput`.
    std::string GetCommandLine(const std::shared_ptr<CallSpec::Input>& input);
    /// What `ExecuteInternal` takes from a process that printed this, which is not empty, and ended
    /// with this raw status: the messages of its `ERROR:` lines, or else the value, the message
    /// about one that cannot be built, or that of a process that a signal ended without one.
    static void ReadPrinted(std::string_view printed, int status, CallSpec::Output& output);

    /// The value with a backslash in front of each character that `isBadChar` names.
    [[nodiscard]] std::string SanitizeInput(const std::string& value) const;
    /// The value without that character.
    [[nodiscard]] std::string SanitizeChar(const std::string& value, char c) const;

private:
    std::shared_ptr<CallSpec::InputSpec> _extensionInputSpec;
    std::shared_ptr<CallSpec::OutputSpec> _extensionOutputSpec;
    std::string _executeCommand;
    std::string _stdin;
};

/// The characters that would mean something to the shell: line feed and !"$&'()*;<>\^`|
ZELMAR_EXPORT bool isBadChar(char c);

/// Where the span that opens at `start` closes, with spans inside it counted: its start and its
/// size, with both delimiters. (0, 0) when it does not close before `end`. Text at `start` that is
/// not the opening delimiter counts as if one stood in front of it.
ZELMAR_EXPORT std::pair<unsigned long, unsigned long> FindPairedTokenSize(const char* text,
                                                                          unsigned long start,
                                                                          unsigned long end,
                                                                          char open, char close);

}  // namespace AutoCli
