// The templates of an extension command: which form becomes what, and how values are protected.

#include <zelmar/autocli/extension/ExtensionCommand.h>
#include <zelmar/autocli/extension/LeftoverConditions.h>
#include <zelmar/autocli/extension/TemplateForms.h>

#include <boost/algorithm/string/join.hpp>

using CallSpec::Input;

namespace AutoCli {

std::string ExtensionCommand::SubstituteInput(const std::shared_ptr<Input>& input, bool isStdin) {
    std::string text = isStdin ? _stdin : _executeCommand;
    if (text.find('$') != std::string::npos) {
        for (const auto& parameter : GetInputSpec()->GetParameterSpecs()) {
            if (input->HasParameter(parameter->GetName())) {
                SubstituteParameter(text, *input, parameter->GetName(), isStdin);
            }
        }
        RemoveLeftoverConditions(text);
    }
    std::erase(text, '\0');
    return text;
}

void ExtensionCommand::SubstituteParameter(std::string& text, const Input& input,
                                           const std::string& name, bool isStdin) const {
    if (const auto last = FindLastValue(text, name)) {
        const std::string& value = input.GetParameter(name);
        ReplaceValues(text, name,
                      isStdin          ? value
                      : last->isQuoted ? SanitizeChar(value, '\'')
                                       : SanitizeInput(value));
    }
    ReplaceConditions(text, name);
    if (const auto list = FindLastJoinedList(text, name)) {
        ReplaceJoinedLists(text, name, JoinedList(input, name, list->text, list->quote, isStdin));
    }
    if (const auto list = FindLastRepeatedList(text, name)) {
        ReplaceRepeatedLists(text, name,
                             RepeatedList(input, name, list->text, list->quote, isStdin));
    }
}

std::string ExtensionCommand::JoinedList(const Input& input, const std::string& name,
                                         const std::string& separator, bool quote,
                                         bool isStdin) const {
    std::vector<std::string> values;
    input.GetParameterList(name, values);
    std::string list = boost::algorithm::join(values, separator);
    if (!isStdin) {
        list = SanitizeInput(list);
    }
    return quote ? '"' + list + '"' : list;
}

std::string ExtensionCommand::RepeatedList(const Input& input, const std::string& name,
                                           const std::string& prefix, bool quote,
                                           bool isStdin) const {
    std::vector<std::string> values;
    input.GetParameterList(name, values);
    std::string list;
    for (const std::string& value : values) {
        list.append(" ").append(prefix).append(" ");
        if (quote) {
            list.append("\"").append(isStdin ? value : SanitizeChar(value, '"')).append("\"");
        } else {
            list.append(isStdin ? value : SanitizeInput(value));
        }
    }
    return list;
}

std::string ExtensionCommand::SanitizeInput(const std::string& value) const {
    std::string sanitized;
    sanitized.reserve(value.size());
    for (const char c : value) {
        if (isBadChar(c)) {
            sanitized += '\\';
        }
        sanitized += c;
    }
    return sanitized;
}

std::string ExtensionCommand::SanitizeChar(const std::string& value, char c) const {
    std::string sanitized = value;
    std::erase(sanitized, c);
    return sanitized;
}

bool isBadChar(char c) {
    constexpr std::string_view badChars = "\n!\"$&'()*;<>\\^`|";
    return badChars.find(c) != std::string_view::npos;
}

std::pair<unsigned long, unsigned long> FindPairedTokenSize(const char* text, unsigned long start,
                                                            unsigned long end, char open,
                                                            char close) {
    unsigned long depth = 1;
    for (unsigned long i = start; i < end; ++i) {
        if (text[i] == open) {
            depth += i == start ? 0 : 1;
        } else if (text[i] == close && --depth == 0) {
            return {start, i - start + 1};
        }
    }
    return {0, 0};
}

}  // namespace AutoCli
