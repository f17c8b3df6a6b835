#include <zelmar/autocli/OptionParser.h>
#include <zelmar/callspec/InputSpec.h>
#include <zelmar/internal/Ascii.h>
#include <zelmar/internal/platform/SilentTerminal.h>

#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <iostream>
#include <string_view>

using CallSpec::ParameterSpec;

namespace AutoCli {

namespace {

bool IsBlank(char c) {
    return c == ' ' || c == '\t';
}

bool IsNameCharacter(char c) {
    return Ascii::IsAlnum(c) || c == '-';
}

bool IsLongName(std::string_view name) {
    return name.size() >= 2 && Ascii::IsAlpha(name[0]) && Ascii::ConsistsOf(name, IsNameCharacter);
}

struct OptionWord {
    std::string_view name;
    std::optional<std::string_view> value;
};

// A scan and not an expression, so that a word of any length is told apart in linear time.
std::optional<OptionWord> ReadOption(std::string_view token) {
    if (token.size() == 2 && token[0] == '-' && Ascii::IsAlpha(token[1])) {
        return OptionWord{token.substr(1), std::nullopt};
    }
    if (!token.starts_with("--")) {
        return std::nullopt;
    }
    const std::string_view body = token.substr(2);
    const size_t equals = body.find('=');
    const std::string_view name = body.substr(0, equals);
    if (!IsLongName(name) || equals + 1 == body.size()) {
        return std::nullopt;
    }
    if (equals == std::string_view::npos) {
        return OptionWord{name, std::nullopt};
    }
    return OptionWord{name, body.substr(equals + 1)};
}

std::string TakeTop(std::stack<std::string>& words) {
    std::string word = std::move(words.top());
    words.pop();
    return word;
}

bool HasOption(const std::vector<OptionParser::Option>& options, const std::string& name) {
    return std::ranges::find(options, name, &OptionParser::Option::first) != options.end();
}

std::vector<std::string> ValuesOf(const std::vector<OptionParser::Option>& options,
                                  const std::string& name) {
    std::vector<std::string> values;
    for (const auto& [optionName, value] : options) {
        if (optionName == name) {
            values.push_back(value);
        }
    }
    return values;
}

std::string Dump(const std::vector<OptionParser::Option>& options) {
    std::string text;
    for (const auto& [name, value] : options) {
        text.append("\n   --").append(name).append(" = '").append(value).append("'");
    }
    return text;
}

std::string WithoutQuotes(std::string_view text) {
    std::string word(text);
    std::erase(word, '"');
    return word;
}

// Where the result leaves another way, a prompt goes to the terminal that is typed on.
void Prompt(const std::string& text) {
    if (!WriteBesideOutput(text)) {
        std::cout << text << std::flush;
    }
}

}  // namespace

OptionParser::OptionParser() : OptionParser("kelvash") {}

OptionParser::OptionParser(const std::string& dispatcher) : _dispatcher(dispatcher) {}

void OptionParser::ParseArgv(int argc, const char* const* argv) {
    std::stack<std::string> words;
    for (int i = argc - 1; i > 0; --i) {
        words.emplace(argv[i]);
    }
    if (argc > 0) {
        _dispatcher = argv[0];
    }
    ParseStack(std::move(words));
}

void OptionParser::ParseVector(std::vector<std::string> words) {
    std::stack<std::string> stack;
    for (auto word = words.rbegin(); word != words.rend(); ++word) {
        stack.push(std::move(*word));
    }
    ParseStack(std::move(stack));
}

void OptionParser::ParseStack(std::stack<std::string> words) {
    if (words.empty()) {
        return;
    }
    _dispatcherParameters = ParseParameters(words);
    _commandPath = ParsePath(words);
    _arguments = std::move(words);
}

std::vector<OptionParser::Option> OptionParser::ParseParameters(std::stack<std::string>& words) {
    std::vector<Option> options;
    while (!words.empty() && IsParameter(words.top())) {
        const std::string token = TakeTop(words);
        std::string name;
        std::string value;
        if (!ParseParameter(token, name, value)) {
            const bool valueFollows = !words.empty() && !IsParameter(words.top());
            value = valueFollows ? TakeTop(words) : ValueOfBareOption(token, name);
        }
        options.emplace_back(std::move(name), std::move(value));
    }
    return options;
}

std::string OptionParser::ValueOfBareOption(const std::string& token, const std::string& name) {
    const ParameterSpec* parameter = _inputSpec ? _inputSpec->FindOption(name) : nullptr;
    if (!parameter) {
        return "";  // an unknown name is for the validation to report
    }
    if (parameter->IsSecret()) {
        if (auto secret = PromptForSecret(parameter->GetName())) {
            return std::move(*secret);
        }
    } else if (parameter->GetParameterType() == CallSpec::ParameterTypeFlag ||
               parameter->GetName() == "help") {
        return "";
    }
    _errors.push_back(token + " must have value");
    return "";
}

std::optional<std::string> OptionParser::PromptForSecret(const std::string& fullName) {
    Prompt("Enter value for '" + fullName + "': ");
    std::string value = GetSilentString();
    Prompt("\n");
    if (std::cin || isatty(STDIN_FILENO) == 0) {
        return value;
    }
    // Ctrl-D ends one prompt and not the terminal.
    std::clearerr(stdin);
    std::cin.clear();
    return std::nullopt;
}

std::list<std::string> OptionParser::ParsePath(std::stack<std::string>& words) {
    std::list<std::string> path;
    while (!words.empty() && !IsParameter(words.top())) {
        path.push_back(TakeTop(words));
    }
    return path;
}

bool OptionParser::ParseParameter(const std::string& token, std::string& name, std::string& value) {
    const auto option = ReadOption(token);
    if (!option) {
        _errors.push_back("Attempt to parse option failed.  Input was : " + token);
        return false;
    }
    name = option->name;
    if (option->value) {
        value = *option->value;
    }
    return option->value.has_value();
}

bool OptionParser::IsParameter(const std::string& token) {
    return ReadOption(token).has_value();
}

// Blanks ahead of the first word are passed over by their number, wherever quotes stand among them:
// each of these quotes lets one more of the blanks behind it into the word.
std::vector<std::string> OptionParser::SplitLine(std::string_view line) {
    const size_t first = std::min(line.find_first_not_of(" \t\""), line.size());
    if (line.substr(first).starts_with('#')) {
        return {};
    }
    const std::string_view lead = line.substr(0, first);
    auto start = static_cast<size_t>(std::ranges::count_if(lead, IsBlank));
    bool inQuote = (lead.size() - start) % 2 == 1;
    std::vector<std::string> words;
    for (size_t i = first; i < line.size(); ++i) {
        if (line[i] == '"') {
            inQuote = !inQuote;
        } else if (IsBlank(line[i]) && !inQuote) {
            words.push_back(WithoutQuotes(line.substr(start, i - start)));
            start = std::min(line.find_first_not_of(" \t", i), line.size());
            i = start - 1;
        }
    }
    if (std::string last = WithoutQuotes(line.substr(start)); !last.empty()) {
        words.push_back(std::move(last));
    }
    return words;
}

bool OptionParser::ParseString(const std::string& line) {
    std::vector<std::string> words = SplitLine(line);
    if (words.empty()) {
        return true;
    }
    ParseVector(std::move(words));
    return false;
}

void OptionParser::ProcessCommandArguments() {
    if (_arguments.empty()) {
        return;
    }
    _commandParameters = ParseParameters(_arguments);
    if (_arguments.empty()) {
        return;
    }
    std::string complaint = "Found Extra non-parameter arguments at the end of input: ";
    while (!_arguments.empty()) {
        complaint += "'" + TakeTop(_arguments) + "' ";
    }
    _errors.push_back(std::move(complaint));
}

std::string OptionParser::GetSilentString() {
    const SilentTerminal silence;
    std::string line;
    std::getline(std::cin, line);
    return line;
}

std::string OptionParser::ToString() {
    std::string text = "Parsed: ";
    text += _parsed ? '1' : '0';
    text += "\nDispatcher: " + _dispatcher + "\nErrors: ";
    for (const std::string& error : _errors) {
        text += "\n   " + error;
    }
    text += "\nPath: ";
    for (const std::string& word : _commandPath) {
        text += "'" + word + "'";
    }
    text += "\nDispatch Params: " + Dump(_dispatcherParameters) + "\nCommand Params: ";
    ProcessCommandArguments();
    return text + Dump(_commandParameters) + "\n";
}

bool OptionParser::HasDispatcherParameter(const std::string& name) const {
    return HasOption(_dispatcherParameters, name);
}

std::vector<std::string> OptionParser::GetDispatcherParameter(const std::string& name) const {
    return ValuesOf(_dispatcherParameters, name);
}

const std::vector<OptionParser::Option>& OptionParser::GetCommandParameters() {
    ProcessCommandArguments();
    return _commandParameters;
}

bool OptionParser::HasCommandParameter(const std::string& name) {
    return HasOption(GetCommandParameters(), name);
}

std::vector<std::string> OptionParser::GetCommandParameter(const std::string& name) {
    return ValuesOf(GetCommandParameters(), name);
}

}  // namespace AutoCli
