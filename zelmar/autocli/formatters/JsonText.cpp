#include <zelmar/autocli/formatters/JsonEscapes.h>
#include <zelmar/autocli/formatters/JsonText.h>
#include <zelmar/internal/Utf8.h>
#include <zelmar/metaobj/ValueWalk.h>

#include <charconv>

using MetaObj::AllFields;
using MetaObj::Walk;

namespace AutoCli {

namespace {

using Append = std::function<void(std::string_view)>;

constexpr EscapeTable escapes = JsonEscapes();

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
