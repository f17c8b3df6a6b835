#include <zelmar/autocli/formatters/Escape.h>
#include <zelmar/autocli/formatters/JsonText.h>
#include <zelmar/internal/Utf8.h>
#include <zelmar/metaobj/ValueWalk.h>

#include <charconv>

using MetaObj::AllFields;
using MetaObj::Walk;

namespace AutoCli {

namespace {

using Append = std::function<void(std::string_view)>;

constexpr EscapeTable MakeEscapes() {
    constexpr std::string_view digits = "0123456789abcdef";
    EscapeTable escapes;
    for (unsigned char byte = 0; byte < 0x20; ++byte) {
        const char code[] = {'\\', 'u', '0', '0', digits[byte >> 4], digits[byte & 0xF]};
        escapes.Set(byte, {code, sizeof code});
    }
    escapes.Set('"', "\\\"");
    escapes.Set('\\', "\\\\");
    escapes.Set('\b', "\\b");
    escapes.Set('\t', "\\t");
    escapes.Set('\n', "\\n");
    escapes.Set('\f', "\\f");
    escapes.Set('\r', "\\r");
    return escapes;
}

constexpr EscapeTable escapes = MakeEscapes();

class JsonTextWriter {
public:
    static constexpr int fieldDepth = 0;
    static constexpr int itemDepth = 0;

    explicit JsonTextWriter(const Append& append) : _append(append) {}

    static AllFields FieldsOf(const MetaObj::MetaStruct& value) { return AllFields(value); }

    void Bool(bool value, int /*level*/) { _append(value ? "true" : "false"); }
    void Int(long value, int /*level*/) {
        char digits[24];
        _append({digits, std::to_chars(std::begin(digits), std::end(digits), value).ptr});
    }
    void String(const std::string& value, int /*level*/) {
        _append("\"");
        AutoCli_RepairUtf8(value,
                           [this](std::string_view piece) { Escape(piece, escapes, _append); });
        _append("\"");
    }
    void Other(const MetaObj::MetaObject* /*value*/) { _append("null"); }

    void OpenStruct(const MetaObj::MetaStruct& /*value*/, int /*level*/) { _append("{"); }
    Walk OpenField(const AllFields& field, int level) {
        String(field.Name(), level);
        _append(":");
        return Walk::Into;
    }
    void CloseField(bool isLast, int /*level*/) { Separate(isLast); }
    void CloseStruct(int /*level*/) { _append("}"); }

    Walk OpenList(const MetaObj::MetaList& /*value*/, int /*level*/) {
        _append("[");
        return Walk::Into;
    }
    void OpenItem(int /*level*/) {}
    void CloseItem(bool isLast) { Separate(isLast); }
    void CloseList(int /*level*/) { _append("]"); }

private:
    void Separate(bool isLast) {
        if (!isLast) {
            _append(",");
        }
    }

    const Append& _append;
};

}  // namespace

void AutoCli_WriteJsonText(const MetaObj::MetaObject* value, const Append& append) {
    JsonTextWriter writer(append);
    MetaObj::ValueWalk<JsonTextWriter>(writer).Run(value, 0);
}

void AutoCli_RepairUtf8(std::string_view text, const Append& append) {
    size_t start = 0;
    for (size_t end = 0; end < text.size();) {
        if (static_cast<unsigned char>(text[end]) < 0x80) {
            ++end;
            continue;
        }
        const Utf8Sequence sequence = LeadingSequence(text.substr(end));
        if (!sequence.isWellFormed) {
            append(text.substr(start, end - start));
            append("\uFFFD");
            start = end + sequence.length;
        }
        end += sequence.length;
    }
    append(text.substr(start));
}

}  // namespace AutoCli
