#pragma once

#include <zelmar/Export.h>

#include <list>
#include <memory>
#include <optional>
#include <stack>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace CallSpec {
class InputSpec;
}

namespace AutoCli {

/// Takes one command line apart: `<tool> [dispatcher options] <path words> [command options]`.
/// Position alone tells whose an option is. The options of the command stay unparsed until they are
/// asked for, since only the command's specification, set in between, tells which of them need a
/// value and which are secrets.
///
/// An option is `-x`, one dash and one ASCII letter, or `--name` or `--name=value`, where the name
/// is a letter and then at least one letter, digit or dash. Every other word is plain. A plain word
/// behind an option that brings no value of its own is that option's value.
///
/// A bad line never throws; complaints gather in `GetParseErrors`. A parser serves one line.
class ZELMAR_EXPORT OptionParser {
public:
    /// Name and value, as (formatter, json) for `--formatter=json` and (h, empty) for `-h`.
    using Option = std::pair<std::string, std::string>;

    OptionParser();
    explicit OptionParser(const std::string& dispatcher);

    /// argv[0] becomes the dispatcher's name.
    void ParseArgv(int argc, const char* const* argv);
    void ParseVector(std::vector<std::string> words);
    /// The words of a line of a command file: blanks and tabs separate, double quotes group and
    /// vanish, and "#" in front of the first word opens a comment. A last word that is empty is
    /// none.
    static std::vector<std::string> SplitLine(std::string_view line);
    /// Splits a line and parses its words. True when there was none, and then nothing was parsed.
    bool ParseString(const std::string& line);
    /// The first word lies on top.
    void ParseStack(std::stack<std::string> words);

    /// Takes the run of options off the top of the words.
    std::vector<Option> ParseParameters(std::stack<std::string>& words);
    /// Takes the run of plain words off the top of the words.
    std::list<std::string> ParsePath(std::stack<std::string>& words);
    /// True when the option brings a value of its own. A word that is no option leaves a complaint,
    /// and `name` and `value` as they were.
    bool ParseParameter(const std::string& token, std::string& name, std::string& value);
    static bool IsParameter(const std::string& token);

    /// Parses the options of the command, once. An option that needs a value and has none is a
    /// complaint, "<option> must have value"; for a secret, the value is asked for on standard
    /// output and read from standard input. Where standard output is no terminal and standard input
    /// is the controlling one, the question is asked there. Ctrl-D at a terminal is no value; from
    /// elsewhere the end of input is an empty one. Without a specification, nothing of this
    /// happens.
    void ProcessCommandArguments();
    /// Counts only ahead of the parsing of the command's options.
    void SetInputSpec(std::shared_ptr<CallSpec::InputSpec> spec) { _inputSpec = std::move(spec); }

    /// Reads one line from standard input, with the terminal's echo off if it is a terminal. A
    /// signal that ends or stops the process meanwhile, or that the host handles, finds the echo
    /// on.
    std::string GetSilentString();

    /// A dump for diagnosis.
    std::string ToString();
    [[nodiscard]] bool IsParsed() const { return _parsed; }

    [[nodiscard]] const std::vector<std::string>& GetParseErrors() const { return _errors; }
    [[nodiscard]] const std::list<std::string>& GetCommandPath() const { return _commandPath; }
    [[nodiscard]] const std::list<std::string>& GetNamespaces() const { return _commandPath; }
    [[nodiscard]] const std::string& GetDispatcher() const { return _dispatcher; }

    [[nodiscard]] const std::vector<Option>& GetDispatcherParameters() const {
        return _dispatcherParameters;
    }
    [[nodiscard]] bool HasDispatcherParameter(const std::string& name) const;
    /// The values of all options of that name, in order.
    [[nodiscard]] std::vector<std::string> GetDispatcherParameter(const std::string& name) const;

    /// These parse the options of the command if that has not happened yet.
    const std::vector<Option>& GetCommandParameters();
    bool HasCommandParameter(const std::string& name);
    std::vector<std::string> GetCommandParameter(const std::string& name);

private:
    std::string ValueOfBareOption(const std::string& token, const std::string& name);
    std::optional<std::string> PromptForSecret(const std::string& fullName);

    bool _parsed = false;
    std::vector<std::string> _errors;
    std::string _dispatcher;
    std::list<std::string> _commandPath;
    std::vector<Option> _dispatcherParameters;
    std::vector<Option> _commandParameters;
    std::stack<std::string> _arguments;
    std::shared_ptr<CallSpec::InputSpec> _inputSpec;
};

}  // namespace AutoCli
