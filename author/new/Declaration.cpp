#include <author/new/Declaration.h>

#include <algorithm>
#include <iterator>
#include <regex>
#include <sstream>
#include <stdexcept>

namespace Author {

namespace {

std::vector<std::string> Split(const std::string& text, char separator) {
    std::vector<std::string> parts;
    std::istringstream stream(text);
    for (std::string part; std::getline(stream, part, separator);) {
        parts.push_back(part);
    }
    return parts;
}

bool IsPlainType(const std::string& type) {
    return type == "string" || type == "int" || type == "bool";
}

}  // namespace

std::string NewParameter::Example() const {
    if (!values.empty()) {
        return values.front();
    }
    const std::string item = ItemType();
    return item == "int" ? min.empty() ? "1" : min : item == "bool" ? "yes" : "text";
}

std::string NewCommand::Path(const char* separator) const {
    std::string text = path.front();
    for (size_t i = 1; i < path.size(); ++i) {
        text += separator + path[i];
    }
    return text;
}

NewParameter ReadParameter(const std::string& spec) {
    static const std::regex grammar(
        R"(([a-z][a-z0-9-]+)(\?)?:(?:(flag|(?:string|int|bool)(?:-list)?))"
        R"((?:=(-?[0-9]+)\.\.(-?[0-9]+))?|([A-Za-z0-9._-]+(?:\|[A-Za-z0-9._-]+)+)))");
    std::smatch match;
    const bool isRead = std::regex_match(spec, match, grammar);
    if (!isRead || (match[4].matched && !match.str(3).starts_with("int"))) {
        throw std::invalid_argument(
            "'" + spec +
            "' is no parameter; write NAME:TYPE, or NAME?:TYPE if it can be left out, where NAME "
            "has "
            "two small letters or more and TYPE is string, int, int=MIN..MAX, bool, flag, one of "
            "these with -list behind the word if it may be repeated (string-list, int-list, "
            "bool-list), or values: full|diff");
    }
    NewParameter parameter{match[1], match[3], !match[2].matched, match[4], match[5], {}};
    if (match[6].matched) {
        parameter.type = "string";
        parameter.values = Split(match[6], '|');
    }
    return parameter;
}

NewResult ReadResult(const std::string& spec) {
    std::istringstream stream(spec);
    const std::vector<std::string> words(std::istream_iterator<std::string>(stream), {});
    NewResult result;
    bool isRead = !words.empty();
    if (isRead) {
        result.isList = words[0].ends_with("[]");
        result.type = words[0].substr(0, words[0].size() - (result.isList ? 2 : 0));
        isRead = words.size() == 1 ? IsPlainType(result.type)
                                   : std::regex_match(result.type, std::regex("[A-Z][A-Za-z0-9]*"));
    }
    static const std::regex field("([A-Za-z][A-Za-z0-9]*):(string|int|bool)");
    for (size_t i = 1; i < words.size() && isRead; ++i) {
        std::smatch match;
        isRead = std::regex_match(words[i], match, field);
        if (std::ranges::count(result.fields, match[1].str(), &NewField::name) != 0) {
            throw std::invalid_argument("There are two fields named '" + match.str(1) + "'");
        }
        result.fields.push_back({match[1], match[2]});
    }
    if (!isRead) {
        throw std::invalid_argument(
            "'" + spec +
            "' is no result; write a structure, NAME FIELD:TYPE..., with "
            "[] behind the name if there are several, where TYPE is string, "
            "int or bool, or one of these types alone, or string[]");
    }
    return result;
}

}  // namespace Author
