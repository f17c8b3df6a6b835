#include "Yaml.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <cstdio>

#include "Text.h"

using MetaObj::AllFields;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::Walk;

namespace {

bool IsAlpha(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
}

bool IsPlainCharacter(char c) {
    return IsAlpha(c) || (c >= '0' && c <= '9') ||
           std::string_view("_-./@+ ").find(c) != std::string_view::npos;
}

// Words that stand for something else, whatever their case.
bool IsKeyword(std::string_view text) {
    static constexpr std::array<std::string_view, 9> words = {"y",     "n",  "yes", "no",  "true",
                                                              "false", "on", "off", "null"};
    std::string lower(text.substr(0, 6));
    std::ranges::transform(lower, lower.begin(), [](unsigned char c) { return std::tolower(c); });
    return text.size() < 6 && std::ranges::find(words, lower) != words.end();
}

// What is no keyword and begins with a letter or a slash is no number, date or mark either.
bool IsPlain(std::string_view text) {
    return !text.empty() && (IsAlpha(text.front()) || text.front() == '/') && text.back() != ' ' &&
           std::ranges::all_of(text, IsPlainCharacter) && !IsKeyword(text);
}

// A character that readers refuse or take for the end of a line unless it is escaped.
struct Special {
    std::string_view lead;  // the bytes ahead of the last one
    unsigned char first, last;
    unsigned code;  // of the first
};
constexpr Special specials[] = {
    {"", 0x00, 0x1F, 0x00},           {"", 0x7F, 0x7F, 0x7F},
    {"\xC2", 0x80, 0xA0, 0x80},       {"\xE2\x80", 0xA8, 0xA9, 0x2028},
    {"\xEF\xBB", 0xBF, 0xBF, 0xFEFF}, {"\xEF\xBF", 0xBE, 0xBF, 0xFFFE},
};

/// Writes a text in double quotes.
class Quoted {
public:
    explicit Quoted(Text& text) : _text(text) {}

    void Append(std::string_view text) {
        _text.Append("\"");
        AutoCli::AutoCli_RepairUtf8(text, [this](std::string_view sound) { AppendSound(sound); });
        _text.Append("\"");
    }

private:
    void AppendSound(std::string_view text) {
        size_t start = 0;
        for (size_t end = 0; end < text.size();) {
            const size_t size = EscapedSize(text.substr(end));
            if (size > 0) {
                _text.Append(text.substr(start, end - start), std::string_view(_escape));
                start = end + size;
            }
            end += std::max<size_t>(size, 1);
        }
        _text.Append(text.substr(start));
    }

    // The bytes for which the escape stands; 0 where none is needed.
    size_t EscapedSize(std::string_view text) {
        const char c = text.front();
        if (c == '"' || c == '\\' || c == '\n') {
            std::snprintf(_escape, sizeof _escape, "\\%c", c == '\n' ? 'n' : c);
            return 1;
        }
        if (c >= ' ' && c < '\x7F') {
            return 0;
        }
        for (const auto& [lead, first, last, code] : specials) {
            if (text.starts_with(lead) && text.size() > lead.size()) {
                const auto byte = static_cast<unsigned char>(text[lead.size()]);
                if (first <= byte && byte <= last) {
                    const unsigned number = code + byte - first;
                    std::snprintf(_escape, sizeof _escape, number < 0x100 ? "\\x%02X" : "\\u%04X",
                                  number);
                    return lead.size() + 1;
                }
            }
        }
        return 0;
    }

    Text& _text;
    char _escape[8] = {};
};

class YamlWriter {
public:
    static constexpr int fieldDepth = 1;
    static constexpr int itemDepth = 1;

    explicit YamlWriter(Text& text) : _text(text) {}

    static AllFields FieldsOf(const MetaStruct& value) { return AllFields(value); }

    void Bool(bool value, int /*level*/) { Finish(value ? "true" : "false"); }
    void Int(long value, int /*level*/) { Finish(std::to_string(value)); }
    void String(const std::string& value, int /*level*/) {
        if (IsPlain(value)) {
            Finish(value);
            return;
        }
        Separate(" ");
        Quoted(_text).Append(value);
        _text.Append("\n");
    }
    void Other(const MetaObject* /*value*/) { Finish("null"); }

    void OpenStruct(const MetaStruct& value, int /*level*/) {
        if (value.GetFields().empty()) {
            Finish("{}");
        } else {
            Separate("\n");
        }
    }
    Walk OpenField(const AllFields& field, int level) {
        Indent(level);
        AppendKey(field.Name(), level);
        _place = Place::BehindKey;
        return Walk::Into;
    }
    void CloseField(bool /*isLast*/, int /*level*/) {}
    void CloseStruct(int /*level*/) {}

    Walk OpenList(const MetaList& value, int /*level*/) {
        if (value.GetCount() == 0) {
            Finish("[]");
            return Walk::Past;
        }
        Separate("\n");
        return Walk::Into;
    }
    void OpenItem(int level) {
        Indent(level);
        _text.Append("- ");
        _place = Place::BehindDash;
    }
    void CloseItem(bool /*isLast*/) {}
    void CloseList(int /*level*/) {}

private:
    enum class Place { LineStart, BehindKey, BehindDash };

    // Behind a key a scalar stands on the same line and anything else on the next one; behind a
    // dash everything begins at once.
    void Separate(std::string_view behindKey) {
        if (_place == Place::BehindKey) {
            _text.Append(behindKey);
            _place = Place::LineStart;
        }
    }

    void Finish(std::string_view scalar) {
        Separate(" ");
        _text.Append(scalar, "\n");
        _place = Place::LineStart;
    }

    void Indent(int level) {
        if (_place != Place::BehindDash) {
            for (int i = 0; i < level; ++i) {
                _text.Append("  ");
            }
        }
        _place = Place::LineStart;
    }

    // Readers look for the colon of a key within 1024 characters, unless it is marked.
    void AppendKey(const std::string& name, int level) {
        constexpr size_t longest = 1024 / 6;
        if (IsPlain(name) && name.size() <= longest) {
            _text.Append(name, ":");
            return;
        }
        _text.Append(name.size() > longest ? "? " : "");
        Quoted(_text).Append(name);
        if (name.size() > longest) {
            _text.Append("\n");
            Indent(level);
        }
        _text.Append(":");
    }

    Text& _text;
    Place _place = Place::LineStart;
};

// A reader of the values that refuses what the notation cannot carry.
class NulFinder {
public:
    static constexpr int fieldDepth = 0;
    static constexpr int itemDepth = 0;

    static AllFields FieldsOf(const MetaStruct& value) { return AllFields(value); }

    void Bool(bool /*value*/, int /*level*/) {}
    void Int(long /*value*/, int /*level*/) {}
    void String(const std::string& value, int /*level*/) { Require(value); }
    void Other(const MetaObject* /*value*/) {}
    void OpenStruct(const MetaStruct& /*value*/, int /*level*/) {}
    Walk OpenField(const AllFields& field, int /*level*/) {
        Require(field.Name());
        return Walk::Into;
    }
    void CloseField(bool /*isLast*/, int /*level*/) {}
    void CloseStruct(int /*level*/) {}
    Walk OpenList(const MetaList& /*value*/, int /*level*/) { return Walk::Into; }
    void OpenItem(int /*level*/) {}
    void CloseItem(bool /*isLast*/) {}
    void CloseList(int /*level*/) {}

private:
    static void Require(const std::string& text) {
        if (text.find('\0') != std::string::npos) {
            throw Zelmar::ZelmarException(
                "Error: YAML cannot carry a text that holds a NUL character");
        }
    }
};

}  // namespace

YamlFormatter::YamlFormatter() : Formatter("yaml") {
    _description = "Print the output as YAML, for configuration files and people.";
}

bool YamlFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                           AutoCli::FormatParameters& /*parameters*/,
                           AutoCli::DisplayContext& /*context*/, std::ostream& stream) {
    const auto root = output->GetRootObject();
    NulFinder finder;
    MetaObj::ValueWalk<NulFinder>(finder).Run(root.get(), 0);
    Text text(stream);
    YamlWriter writer(text);
    MetaObj::ValueWalk<YamlWriter>(writer).Run(root.get(), 0);
    text.Finish();
    return true;
}
