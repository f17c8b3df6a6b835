#pragma once

#include <zelmar/Export.h>

#include <memory>
#include <string>
#include <vector>

namespace CallSpec {
class ParameterSpec;
}

namespace AutoCli {

class CommandSpec;
class Dispatcher;
class NamespaceNode;
class OptionParser;

/// Something that can follow.
struct ZELMAR_EXPORT CompletionCandidate {
    /// The word, behind the stem. Any bytes: who inserts it has to quote it.
    std::string text;
    /// One line, or empty. Any bytes but line feeds: who shows it has to neutralise it.
    std::string description;
};

/// Which names of files can follow beside the candidates. The library looks at no folder itself.
enum CompletionFiles : int {
    CompletionFilesNone = 0,
    CompletionFilesAny = 1,
    CompletionFilesPlugins = 2,  ///< those that end in .xml or .so
    CompletionFilesDirectories = 3,
};

/// What can follow on a line.
struct ZELMAR_EXPORT Completion {
    /// The beginning of the last word that stays, such as "--formatter=". Candidates and names of
    /// files come behind it.
    std::string stem;
    /// Each begins with what was typed behind the stem; in the order in which they are to be shown.
    std::vector<CompletionCandidate> candidates;
    /// Does a candidate end its word, so that a blank may follow? If not, more is to be typed, as
    /// behind "fields=".
    bool endsWord = true;
    CompletionFiles files = CompletionFilesNone;
    /// What is asked for, in words, where it cannot be listed.
    std::string message;
};

/// Tells what can follow on a half-typed command line: options of the tool and their values, the
/// path, options of the command and their values. It reads a line as `OptionParser` does and asks
/// the tree and the declarations alone, so that nothing runs and nothing is printed.
///
/// There is one exception: where a parameter has a source of values (see
/// `CommandSpec::SetValuesSource`), that command runs, in a process of its own that sees no
/// terminal and no error stream and has half a second. When it fails or is late there are no
/// candidates.
///
/// Plugins that the line names are not loaded; `AutoCli_AnswerCompletion` does that first.
class ZELMAR_EXPORT Completer {
public:
    /// The dispatcher must outlive this.
    explicit Completer(Dispatcher& dispatcher) : _dispatcher(dispatcher) {}

    /// The words typed so far, without the name of the tool. The last one is the one to complete,
    /// up to the cursor: it may be empty or half typed. What cannot be resolved gives nothing; no
    /// exception leaves.
    Completion Complete(std::vector<std::string> words) const;

private:
    struct Place;

    void CompleteToolOption(const OptionParser& parser, const Place& place,
                            Completion& completion) const;
    void CompleteToolValue(const OptionParser& parser, const Place& place,
                           Completion& completion) const;
    void CompleteFormatParam(const OptionParser& parser, Completion& completion) const;
    void CompleteBehindPath(OptionParser& parser, const Place& place, Completion& completion) const;
    void CompleteCommandOption(OptionParser& parser, CommandSpec& command, const Place& place,
                               Completion& completion) const;
    void CompleteValue(const CommandSpec& command, const CallSpec::ParameterSpec& parameter,
                       Completion& completion) const;

    Dispatcher& _dispatcher;
};

}  // namespace AutoCli
