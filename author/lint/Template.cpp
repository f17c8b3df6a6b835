#include <author/lint/Suggest.h>
#include <author/lint/Template.h>
#include <zelmar/zelmar.h>

#include <algorithm>
#include <optional>
#include <utility>

namespace Author {

namespace {

using Kind = TemplateNode::Kind;

constexpr size_t npos = std::string_view::npos;
constexpr int deepestForm = 50;

const std::vector<std::string> formNames = {"val", "if", "list", "multilist"};

std::string UsageOf(const std::string& form) {
    if (form == "val") {
        return "$val{NAME}";
    }
    if (form == "if") {
        return "$if{NAME,TEXT}, with at least one character of text";
    }
    if (form == "list") {
        return "$list{NAME,'c',true} or ...,false}, with one character c";
    }
    return "$multilist{NAME,PREFIX,true} or ...,false}";
}

bool IsLetter(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
}

// The list's ending at `at`, with its word.
std::optional<bool> TakeListEnd(std::string_view text, size_t& at) {
    for (const bool quote : {true, false}) {
        const std::string_view end = quote ? ",true}" : ",false}";
        if (text.substr(std::min(at, text.size())).starts_with(end)) {
            at += end.size();
            return quote;
        }
    }
    return std::nullopt;
}

class Reader {
public:
    explicit Reader(std::string_view text) : _text(text) {}

    Template Read() {
        _template.nodes = ReadNodes(false);
        return std::move(_template);
    }

private:
    // Up to the brace that closes the condition around them, or to the end.
    std::vector<TemplateNode> ReadNodes(bool isBody) {
        std::vector<TemplateNode> nodes;
        std::string plain;
        int braces = 0;
        while (_at < _text.size()) {
            if (isBody && _text[_at] == '}' && braces == 0) {
                break;
            }
            if (_text[_at] == '$') {
                TemplateNode form;
                const size_t begin = _at;
                if (ReadForm(form)) {
                    AddText(nodes, plain);
                    form.text = _text.substr(begin, _at - begin);
                    nodes.push_back(std::move(form));
                    continue;
                }
                _at = begin;
            }
            braces += _text[_at] == '{' ? 1 : _text[_at] == '}' && braces > 0 ? -1 : 0;
            plain += _text[_at++];
        }
        AddText(nodes, plain);
        return nodes;
    }

    static void AddText(std::vector<TemplateNode>& nodes, std::string& plain) {
        if (!plain.empty()) {
            nodes.emplace_back().text = std::exchange(plain, "");
        }
    }

    bool ReadForm(TemplateNode& form) {
        const size_t word = _at + 1;
        size_t end = word;
        while (end < _text.size() && IsLetter(_text[end])) {
            ++end;
        }
        const std::string name(_text.substr(word, end - word));
        const bool isForm = std::ranges::find(formNames, name) != formNames.end();
        const bool hasBrace = _text.substr(end).starts_with('{');
        if (!isForm) {
            return RefuseWord(name, hasBrace);
        }
        _at = end + 1;
        const size_t nameEnd = std::min(_text.find_first_of(",}", _at), _text.size());
        form.name = _text.substr(std::min(_at, _text.size()), nameEnd - std::min(_at, nameEnd));
        _at = nameEnd;
        if (hasBrace && ReadRest(form, name)) {
            return true;
        }
        AddFault("$" + name + " here is no form; write " + UsageOf(name));
        return false;
    }

    bool RefuseWord(const std::string& word, bool hasBrace) {
        if (hasBrace && !word.empty()) {
            AddFault("there is no form $" + word +
                     "{}; the forms are $val, $if, $list and $multilist" +
                     Suggestion(word, formNames));
        }
        return false;
    }

    void AddFault(const std::string& fault) {
        if (std::ranges::find(_template.faults, fault) == _template.faults.end()) {
            _template.faults.push_back(fault);
        }
    }

    // What stands behind the name.
    bool ReadRest(TemplateNode& form, const std::string& word) {
        const bool hasComma = _text.substr(_at).starts_with(',');
        if (word == "val") {
            form.kind = Kind::Value;
            return !hasComma && _at++ < _text.size();
        }
        if (!hasComma) {
            return false;
        }
        ++_at;
        return word == "if"     ? ReadBody(form)
               : word == "list" ? ReadList(form)
                                : ReadMultiList(form);
    }

    bool ReadBody(TemplateNode& form) {
        form.kind = Kind::If;
        const size_t begin = _at;
        if (++_depth < deepestForm) {
            form.body = ReadNodes(true);
        }
        --_depth;
        const bool closes = _at < _text.size() && _at > begin;
        ++_at;
        return closes;
    }

    bool ReadList(TemplateNode& form) {
        form.kind = Kind::List;
        for (const size_t length : {1u, 0u}) {
            size_t end = _at + 2 + length;
            if (_text.substr(_at).starts_with('\'') &&
                _text.substr(std::min(end - 1, _text.size())).starts_with('\'')) {
                if (const auto quote = TakeListEnd(_text, end)) {
                    form.argument = _text.substr(_at + 1, length);
                    form.quote = *quote;
                    _at = end;
                    return true;
                }
            }
        }
        return false;
    }

    bool ReadMultiList(TemplateNode& form) {
        form.kind = Kind::MultiList;
        for (size_t comma = _text.find(',', _at + 1); comma != npos;
             comma = _text.find(',', comma + 1)) {
            size_t end = comma;
            if (const auto quote = TakeListEnd(_text, end)) {
                form.argument = _text.substr(_at, comma - _at);
                form.quote = *quote;
                _at = end;
                return true;
            }
        }
        return false;
    }

    std::string_view _text;
    size_t _at = 0;
    int _depth = 0;
    Template _template;
};

std::string JoinedList(const TemplateNode& form, const std::vector<std::string>& values,
                       bool isStdin) {
    const bool isProtected =
        !isStdin && !form.argument.empty() && AutoCli::isBadChar(form.argument.front());
    const std::string separator = (isProtected ? "\\" : "") + form.argument;
    std::string joined;
    for (const std::string& value : values) {
        joined += (joined.empty() ? "" : separator) + value;
    }
    return form.quote ? "\"" + joined + "\"" : joined;
}

std::string RepeatedList(const TemplateNode& form, const std::vector<std::string>& values) {
    std::string joined;
    for (const std::string& value : values) {
        joined += " " + form.argument + " " + (form.quote ? "\"" + value + "\"" : value);
    }
    return joined;
}

}  // namespace

Template ReadTemplate(std::string_view text) {
    return Reader(text).Read();
}

std::string Expand(const std::vector<TemplateNode>& nodes, const Given& given, bool isStdin,
                   std::vector<std::string>& left) {
    std::string text;
    for (const TemplateNode& node : nodes) {
        const auto values = given.find(node.name);
        if (node.kind == Kind::Text) {
            text += node.text;
        } else if (node.kind == Kind::If) {
            text += values == given.end() ? "" : Expand(node.body, given, isStdin, left);
        } else if (values == given.end()) {
            left.push_back(node.name);
            text += node.text;
        } else if (node.kind == Kind::Value) {
            text += values->second.front();
        } else {
            text += node.kind == Kind::List ? JoinedList(node, values->second, isStdin)
                                            : RepeatedList(node, values->second);
        }
    }
    return text;
}

}  // namespace Author
