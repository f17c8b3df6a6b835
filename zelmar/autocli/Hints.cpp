// The distance is that of F. J. Damerau, "A technique for computer detection and correction of
// spelling errors", CACM 7 (1964): letters put in, left out, replaced, and neighbours exchanged,
// one each. It is computed by the table of R. A. Wagner and M. J. Fischer, "The string-to-string
// correction problem", J. ACM 21 (1974), of which the last three rows are kept.

#include <zelmar/autocli/Command.h>
#include <zelmar/autocli/Dispatcher.h>
#include <zelmar/autocli/Hints.h>
#include <zelmar/autocli/OptionParser.h>
#include <zelmar/internal/Ascii.h>

#include <algorithm>
#include <list>
#include <numeric>
#include <utility>

using CallSpec::InputSpec;
using CallSpec::ParameterSpec;

namespace AutoCli {

namespace {

constexpr size_t longestTypedName = 100;

size_t Distance(std::string_view from, std::string_view to) {
    std::vector<size_t> beforePrevious;
    std::vector<size_t> previous;
    std::vector<size_t> row(to.size() + 1);
    std::iota(row.begin(), row.end(), size_t{0});
    for (size_t i = 1; i <= from.size(); ++i) {
        beforePrevious = std::exchange(previous, row);
        row[0] = i;
        for (size_t j = 1; j <= to.size(); ++j) {
            const bool same = from[i - 1] == to[j - 1];
            row[j] = std::min({previous[j] + 1, row[j - 1] + 1, previous[j - 1] + (same ? 0 : 1)});
            if (i > 1 && j > 1 && from[i - 1] == to[j - 2] && from[i - 2] == to[j - 1]) {
                row[j] = std::min(row[j], beforePrevious[j - 2] + 1);
            }
        }
    }
    return row.back();
}

// A word that can be shown as it was typed, and be typed again.
bool IsPlain(std::string_view word) {
    return !word.empty() && Ascii::ConsistsOf(word, [](char c) {
        return Ascii::IsAlnum(c) ||
               std::string_view("_./:=@%+,-").find(c) != std::string_view::npos;
    });
}

std::string DidYouMean(const std::string& lead, const std::string& name) {
    return IsPlain(name) ? "Did you mean " + lead + name + "?" : "";
}

std::string Dashed(const std::string& name) {
    return (name.size() == 1 ? "-" : "--") + name;
}

// An option to be typed again; a value that would need quotes is left to its owner.
std::string Typed(const std::string& name, const std::string& value) {
    return Dashed(name) + (value.empty() ? "" : " " + (IsPlain(value) ? value : "..."));
}

std::vector<std::string> LongNames(const InputSpec& spec) {
    std::vector<std::string> names;
    for (const auto& parameter : spec.GetParameterSpecs()) {
        names.push_back(parameter->GetName());
    }
    return names;
}

// Null unless there is exactly one that must be given, and can be where others see it.
const ParameterSpec* OnlyRequired(const InputSpec& spec) {
    const ParameterSpec* required = nullptr;
    for (const auto& parameter : spec.GetParameterSpecs()) {
        if (parameter->IsRequired() && (required || parameter->IsSecret())) {
            return nullptr;
        }
        required = parameter->IsRequired() ? parameter.get() : required;
    }
    return required;
}

// Null when the path leads nowhere.
std::shared_ptr<NamespaceNode> Follow(std::shared_ptr<NamespaceNode> node,
                                      const std::list<std::string>& path) {
    for (const std::string& name : path) {
        if (!node->HasNamespaceNode(name)) {
            return nullptr;
        }
        node = node->GetNamespaceNode(name);
    }
    return node;
}

// The line that failed, and what is known of it so far.
class Line {
public:
    Line(Dispatcher& dispatcher, OptionParser& parser, const std::string& tool,
         std::span<const std::string_view> toolOptions)
        : _dispatcher(dispatcher), _parser(parser), _toolOptions(toolOptions), _lead(tool) {
        for (const auto& [name, value] : parser.GetDispatcherParameters()) {
            if (name == "plugin" || name == "plugin-dir") {  // without it, there is no such path
                _lead += Typed(name, value) + " ";
            }
        }
    }

    std::string FindHint() {
        std::string hint = HintOnTakenWord();
        if (hint.empty()) {
            hint = HintOnPath();
        }
        if (hint.empty()) {
            hint = HintOnToolOptions();
        }
        return hint.empty() && _command ? HintOnCommandOptions() : hint;
    }

private:
    // An option in front of the path takes the next word, which can have been the path's first.
    std::string HintOnTakenWord() {
        const auto root = _dispatcher.GetRootNamespace();
        std::list<std::string> path = _parser.GetCommandPath();
        if (!path.empty() && Follow(root, path)) {
            return "";
        }
        for (const auto& [name, value] : _parser.GetDispatcherParameters()) {
            path.push_front(value);
            if (Follow(root, path)) {
                return Dashed(name) + " took '" + value + "' for its value." +
                       (IsToolOption(name) ? "" : " Options of a command stand behind its path.");
            }
            path.pop_front();
        }
        return "";
    }

    // Goes down the path to the command, if there is one.
    std::string HintOnPath() {
        std::shared_ptr<NamespaceNode> node = _dispatcher.GetRootNamespace();
        for (const std::string& word : _parser.GetCommandPath()) {
            if (_command) {
                return HintOnBareWord(word);
            }
            if (!node->HasNamespaceNode(word)) {
                return DidYouMean("", NearestName(word, node->GetNamespaceNodeNames()));
            }
            node = node->GetNamespaceNode(word);
            _command = std::dynamic_pointer_cast<Command>(node);
            _path += (_path.empty() ? "" : " ") + word;
        }
        return "";
    }

    std::string HintOnBareWord(const std::string& word) {
        const ParameterSpec* required = OnlyRequired(*_command->GetInputSpec());
        // In name=value, the value is but a part of the word.
        if (!required || word != _parser.GetCommandPath().back() || !IsPlain(word) ||
            word.find('=') != std::string::npos) {
            return SeeHelp();
        }
        return "A value follows its option: " + _lead + _path + " --" + required->GetName() + " " +
               word;
    }

    std::string HintOnToolOptions() {
        for (const auto& [name, value] : _parser.GetDispatcherParameters()) {
            if (IsToolOption(name)) {
                continue;
            }
            const ParameterSpec* parameter =
                _command ? _command->GetInputSpec()->FindOption(name) : nullptr;
            if (parameter) {
                return "Options of a command stand behind its path: " + _lead + _path + " " +
                       Typed(name, parameter->IsSecret() ? "" : value);
            }
            const std::string hint =
                DidYouMean("--", NearestName(name, {_toolOptions.begin(), _toolOptions.end()}));
            return hint.empty() ? "See: " + _lead + "--help" : hint;
        }
        return "";
    }

    std::string HintOnCommandOptions() {
        const auto spec = _command->GetInputSpec();
        const auto input = CallSpec::Input::New();
        for (const auto& [name, value] : _parser.GetCommandParameters()) {
            input->AddParameter(name, value);
            const ParameterSpec* parameter = spec->FindOption(name);
            std::string hint = parameter ? HintOnValue(*parameter, value)
                                         : HintOnUnknownOption(*spec, name, value);
            if (!hint.empty()) {
                return hint;
            }
        }
        input->SetInputSpec(spec);
        if (!_parser.GetParseErrors().empty() || !spec->Validate(input, CallSpec::Output::New())) {
            return SeeHelp();
        }
        return HintOnFormatter();
    }

    std::string HintOnUnknownOption(const InputSpec& spec, const std::string& name,
                                    const std::string& value) {
        if (IsToolOption(name)) {
            return "Options of the tool stand ahead of the path: " + _lead + Typed(name, value) +
                   " " + _path;
        }
        return DidYouMean("--", NearestName(name, LongNames(spec)));
    }

    static std::string HintOnValue(const ParameterSpec& parameter, const std::string& value) {
        const auto constraint = parameter.GetConstraint();
        if (!constraint || constraint->GetType() != CallSpec::ConstraintTypeStringEnum ||
            std::ranges::count(constraint->GetStringEnum(), value) != 0) {
            return "";
        }
        return DidYouMean("--" + parameter.GetName() + " ",
                          NearestName(value, constraint->GetStringEnum()));
    }

    std::string HintOnFormatter() {
        const auto wanted = _parser.GetDispatcherParameter("formatter");
        if (wanted.size() != 1 || _dispatcher.HasFormatter(wanted.front())) {
            return "";
        }
        std::vector<std::string> names;
        for (const auto& formatter : _dispatcher.GetFormatters()) {
            names.push_back(formatter->GetName());
        }
        return DidYouMean("--formatter ", NearestName(wanted.front(), names));
    }

    [[nodiscard]] std::string SeeHelp() const { return "See: " + _lead + _path + " --help"; }

    [[nodiscard]] bool IsToolOption(const std::string& name) const {
        return std::ranges::find(_toolOptions, name) != _toolOptions.end();
    }

    Dispatcher& _dispatcher;
    OptionParser& _parser;
    const std::span<const std::string_view> _toolOptions;
    std::string _lead;  // what is typed in front of the path
    std::string _path;  // as far as it was followed
    std::shared_ptr<Command> _command;
};

}  // namespace

std::string FindHint(Dispatcher& dispatcher, OptionParser& parser, const std::string& tool,
                     std::span<const std::string_view> toolOptions) {
    return Line(dispatcher, parser, tool, toolOptions).FindHint();
}

std::string NearestName(std::string_view word, const std::vector<std::string>& names) {
    if (word.size() > longestTypedName) {
        return "";
    }
    size_t least = word.size() / 3 + 1;
    std::string nearest;
    for (const std::string& name : names) {
        // As many letters as one is longer than the other are too many already.
        if (name.size() > word.size() + least || word.size() > name.size() + least) {
            continue;
        }
        const size_t distance = Distance(word, name);
        if (distance < least) {
            least = distance;
            nearest = name;
        } else if (distance == least) {
            nearest.clear();
        }
    }
    return nearest;
}

}  // namespace AutoCli
