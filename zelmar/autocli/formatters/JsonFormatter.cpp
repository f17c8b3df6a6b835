#include <zelmar/autocli/formatters/JsonEscapes.h>
#include <zelmar/autocli/formatters/JsonFormatter.h>
#include <zelmar/autocli/formatters/ValueWriter.h>

using MetaObj::AllFields;
using MetaObj::MetaList;
using MetaObj::MetaStruct;
using MetaObj::Walk;

namespace AutoCli {

namespace {

constexpr EscapeTable escapes = [] {
    EscapeTable table = JsonEscapes(0x7F);
    table.Set('/', "\\/");
    return table;
}();

class JsonWriter : public ValueWriter {
public:
    static constexpr int fieldDepth = 2;
    static constexpr int itemDepth = 3;

    using ValueWriter::ValueWriter;

    void Bool(bool value, int /*level*/) { _text.Append(value ? "true" : "false"); }
    void Int(long value, int /*level*/) { _text.AppendNumber(value); }
    void String(const std::string& value, int /*level*/) {
        _text.Append("\"");
        Escape(value, escapes, [this](std::string_view piece) { _text.Append(piece); });
        _text.Append("\"");
    }

    void OpenStruct(const MetaStruct& /*value*/, int level) { OpenBracket("{", level); }
    Walk OpenField(const AllFields& field, int level) {
        _text.AppendIndent(level);
        _text.Append("   \"", field.Name(), "\": ");
        return Walk::Into;
    }
    void CloseField(bool isLast, int /*level*/) { WriteLine(isLast ? "" : ","); }
    void CloseStruct(int level) { CloseBracket("}", level); }

    Walk OpenList(const MetaList& /*value*/, int level) {
        OpenBracket("[", level);
        return Walk::Into;
    }
    void OpenItem(int level) { _text.AppendIndent(level); }
    void CloseItem(bool isLast) { WriteLine(isLast ? "" : ", "); }
    void CloseList(int level) { CloseBracket("]", level); }

private:
    void OpenBracket(std::string_view bracket, int level) {
        _text.EndLine();
        _text.AppendIndent(level);
        WriteLine(bracket);
    }
    void CloseBracket(std::string_view bracket, int level) {
        _text.AppendIndent(level);
        _text.Append(bracket);
    }
};

}  // namespace

JsonFormatter::JsonFormatter() : Formatter("json") {
    _description = "Print the output as JSON.";
}

bool JsonFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                           FormatParameters& /*parameters*/, DisplayContext& context,
                           std::ostream& stream) {
    TextWriter text(stream, context);
    WriteValue<JsonWriter>(text, output->GetRootObject().get(), -1);
    text.EndLine();
    text.Finish();
    return true;
}

void JsonFormatter::Format(const std::shared_ptr<MetaObj::MetaObject>& value, std::ostream& stream,
                           int level) const {
    TextWriter text(stream);
    WriteValue<JsonWriter>(text, value.get(), level);
    text.Finish();
}

}  // namespace AutoCli
