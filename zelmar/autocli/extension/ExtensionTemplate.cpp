// The templates of an extension command: which form becomes what, and how values are protected.

#include <zelmar/autocli/extension/ExtensionCommand.h>
#include <zelmar/autocli/extension/LeftoverConditions.h>
#include <zelmar/autocli/extension/TemplateForms.h>

#include <boost/algorithm/string/join.hpp>

using CallSpec::Input;

namespace AutoCli {

namespace {

std::string Escape(const std::string& value) {
    std::string escaped;
    escaped.reserve(value.size());
    for (const char c : value) {
        if (isBadChar(c)) {
            escaped += '\\';
        }
        escaped += c;
    }
    return escaped;
}

std::string Without(std::string value, char c) {
    std::erase(value, c);
    return value;
}

std::vector<std::string> ValuesOf(const Input& input, const std::string& name) {
    std::vector<std::string> values;
    input.GetParameterList(name, values);
    return values;
}

// Replaces the forms of one parameter that was given.
class Substitution {
public:
    Substitution(const Input& input, const std::string& name, bool isStdin)
        : _input(input), _name(name), _isStdin(isStdin) {}

    void Run(std::string& text) const {
        ReplaceValues(text, _name, [this](bool isQuoted) { return Value(isQuoted); });
        ReplaceConditions(text, _name);
        ReplaceJoinedLists(text, _name, [this](std::string_view separator, bool quote) {
            return JoinedList(separator, quote);
        });
        ReplaceRepeatedLists(text, _name, [this](std::string_view prefix, bool quote) {
            return RepeatedList(prefix, quote);
        });
    }

private:
    [[nodiscard]] std::string Protected(const std::string& value) const {
        return _isStdin ? value : Escape(value);
    }

    [[nodiscard]] std::string Unquoted(const std::string& value, char quote) const {
        return _isStdin ? value : Without(value, quote);
    }

    [[nodiscard]] std::string Value(bool isQuoted) const {
        const std::string& value = _input.GetParameter(_name);
        return isQuoted ? Unquoted(value, '\'') : Protected(value);
    }

    [[nodiscard]] std::string JoinedList(std::string_view separator, bool quote) const {
        const std::string list =
            Protected(boost::algorithm::join(ValuesOf(_input, _name), separator));
        return quote ? '"' + list + '"' : list;
    }

    [[nodiscard]] std::string RepeatedList(std::string_view prefix, bool quote) const {
        std::string list;
        for (const std::string& value : ValuesOf(_input, _name)) {
            list.append(" ").append(prefix).append(" ");
            list.append(quote ? '"' + Unquoted(value, '"') + '"' : Protected(value));
        }
        return list;
    }

    const Input& _input;
    const std::string& _name;
    const bool _isStdin;
};

}  // namespace

std::string ExtensionCommand::SubstituteInput(const std::shared_ptr<Input>& input, bool isStdin) {
    std::string text = isStdin ? _stdin : _executeCommand;
    if (text.find('$') != std::string::npos) {
        for (const auto& parameter : GetInputSpec()->GetParameterSpecs()) {
            if (input->HasParameter(parameter->GetName())) {
                Substitution(*input, parameter->GetName(), isStdin).Run(text);
            }
        }
        RemoveLeftoverConditions(text);
    }
    std::erase(text, '\0');
    return text;
}

std::string ExtensionCommand::SanitizeInput(const std::string& value) const {
    return Escape(value);
}

std::string ExtensionCommand::SanitizeChar(const std::string& value, char c) const {
    return Without(value, c);
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
