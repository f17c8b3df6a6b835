#include <zelmar/autocli/Dispatcher.h>
#include <zelmar/autocli/OptionParser.h>
#include <zelmar/autocli/completion/Completer.h>
#include <zelmar/autocli/completion/ExistingValues.h>

#include <algorithm>
#include <array>
#include <map>
#include <set>
#include <string_view>

using CallSpec::ParameterConstraint;
using CallSpec::ParameterSpec;

namespace AutoCli {

/// Where on the line the last word stands.
struct Completer::Place {
    std::string word;    ///< the last word, as far as it is typed
    std::string option;  ///< the name of the option whose value the word can be, or empty
};

namespace {

struct ToolOption {
    std::string_view name;
    std::string_view description;
    bool isRepeatable = false;
    CompletionFiles files = CompletionFilesNone;
};

constexpr std::array<ToolOption, 7> toolOptions = {{
    {"format-param", "Set a formatter parameter, as <key>=<value>", true},
    {"formatter", "Override the formatter to use for a given command"},
    {"help", "Show how the tool is called"},
    {"input", "Run the command lines of a file, or of STDIN", false, CompletionFilesAny},
    {"plugin", "Add a specific file plugin", true, CompletionFilesPlugins},
    {"plugin-dir", "Add all the plug-ins from this directory", true, CompletionFilesDirectories},
    {"screen-width", "Use the specified screen width when formatting text"},
}};

std::string FirstLine(std::string text) {
    text.erase(std::min(text.find('\n'), text.size()));
    return text;
}

void Add(Completion& completion, std::string text, std::string description = "") {
    completion.candidates.push_back({std::move(text), FirstLine(std::move(description))});
}

// The option that waits for a value in front of the last word, or within it: "--name=va".
std::string OptionToFill(const std::vector<std::string>& words, std::string& stem) {
    const std::string& word = words.back();
    const size_t equals = word.find('=');
    if (word.starts_with("--") && equals != std::string::npos) {
        stem = word.substr(0, equals + 1);
        return word.substr(2, equals - 2);
    }
    if (words.size() < 2) {
        return "";
    }
    const std::string& previous = words[words.size() - 2];
    if (!OptionParser::IsParameter(previous) || previous.find('=') != std::string::npos) {
        return "";
    }
    return previous.substr(previous.find_first_not_of('-'));
}

void AddChildren(NamespaceNode& node, Completion& completion) {
    for (const auto& child : node.GetNamespaceNodes()) {
        Add(completion, child->GetName(), child->GetDescription());
    }
}

bool IsFlag(const ParameterSpec& parameter) {
    return parameter.GetParameterType() == CallSpec::ParameterTypeFlag ||
           parameter.GetName() == "help";
}

bool IsGiven(const ParameterSpec& parameter, const std::vector<OptionParser::Option>& given) {
    return std::ranges::any_of(given, [&parameter](const OptionParser::Option& option) {
        return option.first == parameter.GetName() || option.first == parameter.GetShortName();
    });
}

void AddOption(const ParameterSpec& parameter, bool withShortName, Completion& completion) {
    Add(completion, "--" + parameter.GetName(), parameter.GetDescription(true));
    if (withShortName && !parameter.GetShortName().empty()) {
        Add(completion, "-" + parameter.GetShortName(), parameter.GetDescription(true));
    }
}

template <class Member>
std::string DescriptionOf(const Member& member, const std::map<Member, std::string>& descriptions) {
    const auto description = descriptions.find(member);
    return description == descriptions.end() ? "" : description->second;
}

void AddEnum(const ParameterConstraint& constraint, Completion& completion) {
    for (const long number : constraint.GetIntEnum()) {
        Add(completion, std::to_string(number),
            DescriptionOf(number, constraint.GetIntEnumWithDesc()));
    }
    for (const std::string& member : constraint.GetStringEnum()) {
        Add(completion, member, DescriptionOf(member, constraint.GetStringEnumWithDesc()));
    }
}

// The description and, unless it tells the rule itself, the rule.
std::string ValueInWords(const ParameterSpec& parameter) {
    std::string text = FirstLine(parameter.GetDescription(true));
    if (const auto constraint = parameter.GetConstraint()) {
        const std::string rule = FirstLine(constraint->ToString());
        if (text.find(rule) == std::string::npos) {
            text += (text.empty() ? "" : ": ") + rule;
        }
    }
    return text;
}

void KeepThoseThatBeginWith(std::string_view typed, Completion& completion) {
    std::erase_if(completion.candidates, [typed](const CompletionCandidate& candidate) {
        return !candidate.text.starts_with(typed);
    });
}

}  // namespace

Completion Completer::Complete(std::vector<std::string> words) const {
    if (words.empty()) {
        words.emplace_back();
    }
    Completion completion;
    const Place place = {words.back(), OptionToFill(words, completion.stem)};
    words.pop_back();
    OptionParser parser;
    parser.ParseVector(std::move(words));
    try {
        if (!parser.GetCommandPath().empty()) {
            CompleteBehindPath(parser, place, completion);
        } else if (!place.option.empty() || place.word.starts_with('-')) {
            CompleteToolOption(parser, place, completion);
        } else {
            AddChildren(*_dispatcher.GetRootNamespace(), completion);
        }
    } catch (...) {
        return {};  // a declaration that cannot be built, or a path that leads nowhere
    }
    KeepThoseThatBeginWith(std::string_view(place.word).substr(completion.stem.size()), completion);
    return completion;
}

void Completer::CompleteToolOption(const OptionParser& parser, const Place& place,
                                   Completion& completion) const {
    if (!place.option.empty()) {
        CompleteToolValue(parser, place, completion);
    }
    if (!place.word.starts_with('-') || !completion.stem.empty()) {
        return;
    }
    for (const ToolOption& option : toolOptions) {
        const std::string name(option.name);
        if (option.isRepeatable || !parser.HasDispatcherParameter(name)) {
            Add(completion, "--" + name, std::string(option.description));
        }
    }
}

void Completer::CompleteToolValue(const OptionParser& parser, const Place& place,
                                  Completion& completion) const {
    const auto* const option = std::ranges::find(toolOptions, place.option, &ToolOption::name);
    if (option == toolOptions.end()) {
        return;
    }
    completion.files = option->files;
    if (option->name == "formatter") {
        for (const auto& formatter : _dispatcher.GetFormatters()) {
            Add(completion, formatter->GetName(), formatter->GetDescription());
        }
    } else if (option->name == "format-param") {
        CompleteFormatParam(parser, completion);
    } else if (option->name == "input") {
        Add(completion, "STDIN", "Standard input");
    } else if (option->name == "screen-width") {
        completion.message = option->description;
    }
}

// A key that names a type, as "fields:<TypeName>", goes as far as it is known.
void Completer::CompleteFormatParam(const OptionParser& parser, Completion& completion) const {
    const auto chosen = parser.GetDispatcherParameter("formatter");
    std::set<std::string> keys;
    for (const auto& formatter : _dispatcher.GetFormatters()) {
        if (!chosen.empty() && formatter->GetName() != chosen.back()) {
            continue;
        }
        for (const FormatterParam& parameter : formatter->GetParams()) {
            const size_t placeholder = parameter.name.find('<');
            std::string key = placeholder == std::string::npos
                                  ? parameter.name + "="
                                  : parameter.name.substr(0, placeholder);
            if (keys.insert(key).second) {
                Add(completion, std::move(key), parameter.description);
            }
        }
    }
    completion.endsWord = false;
}

void Completer::CompleteBehindPath(OptionParser& parser, const Place& place,
                                   Completion& completion) const {
    std::list<std::string> path = parser.GetCommandPath();
    const auto node = _dispatcher.GetRootNamespace()->ResolveNode(path);
    const bool hasOptions = !parser.GetCommandParameters().empty();
    if (!parser.GetParseErrors().empty()) {
        return;  // words that belong nowhere stand on the line already
    }
    if (const auto command = std::dynamic_pointer_cast<CommandSpec>(node)) {
        CompleteCommandOption(parser, *command, place, completion);
    } else if (!hasOptions && place.option.empty()) {
        AddChildren(*node, completion);
    }
}

void Completer::CompleteCommandOption(OptionParser& parser, CommandSpec& command,
                                      const Place& place, Completion& completion) const {
    const auto spec = command.GetInputSpec();
    if (!place.option.empty()) {
        const ParameterSpec* const toFill = spec->FindOption(place.option);
        if (toFill && !IsFlag(*toFill)) {
            CompleteValue(command, *toFill, completion);
        }
        const bool takesValue = !toFill || !IsFlag(*toFill);
        // A word such as -5 can be a value or the beginning of an option.
        if (!completion.stem.empty() || (takesValue && !place.word.starts_with('-'))) {
            return;
        }
    }
    for (const bool required : {true, false}) {
        for (const auto& parameter : spec->GetParameterSpecs()) {
            if (parameter->IsRequired() == required &&
                (parameter->AllowMultiple() ||
                 !IsGiven(*parameter, parser.GetCommandParameters()))) {
                AddOption(*parameter, place.word == "-", completion);
            }
        }
    }
}

void Completer::CompleteValue(const CommandSpec& command, const ParameterSpec& parameter,
                              Completion& completion) const {
    if (parameter.IsSecret()) {
        return;
    }
    if (const auto type = parameter.GetParameterType();
        type == CallSpec::ParameterTypeBool || type == CallSpec::ParameterTypeBoolList) {
        Add(completion, "true");
        Add(completion, "false");
    } else if (const auto constraint = parameter.GetConstraint()) {
        AddEnum(*constraint, completion);
    }
    const std::string source = command.GetValuesSource(parameter.GetName());
    if (completion.candidates.empty() && !source.empty()) {
        std::set<std::string> seen;
        for (std::string& value : ExistingValues(_dispatcher, source)) {
            if (seen.insert(value).second) {
                Add(completion, std::move(value));
            }
        }
    }
    if (completion.candidates.empty()) {
        completion.message = ValueInWords(parameter);
    }
}

}  // namespace AutoCli
