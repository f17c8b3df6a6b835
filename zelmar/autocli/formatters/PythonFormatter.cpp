#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/formatters/Escape.h>
#include <zelmar/autocli/formatters/PythonFormatter.h>
#include <zelmar/autocli/formatters/ValueWriter.h>

using MetaObj::AllFields;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::Walk;

namespace AutoCli {

namespace {

constexpr EscapeTable MakeEscapes() {
    EscapeTable escapes;
    escapes.Set('"', "\\\"");
    escapes.Set('\n', "\\n");
    return escapes;
}

constexpr EscapeTable escapes = MakeEscapes();

class PythonWriter : public ValueWriter {
public:
    static constexpr int fieldDepth = 2;
    static constexpr int itemDepth = 2;

    using ValueWriter::ValueWriter;

    void Bool(bool value, int /*level*/) { _text.Append(value ? "True" : "False"); }
    void Int(long value, int /*level*/) { _text.AppendNumber(value); }
    void String(const std::string& value, int /*level*/) {
        _text.Append(R"(""")");
        Escape(value, escapes, [this](std::string_view piece) { _text.Append(piece); });
        _text.Append(R"(""")");
    }

    void OpenStruct(const MetaStruct& /*value*/, int /*level*/) { _text.Append("{"); }
    Walk OpenField(const AllFields& field, int /*level*/) {
        _text.Append("\"", field.Name(), "\": ");
        return Walk::Into;
    }
    void CloseField(bool /*isLast*/, int /*level*/) { _text.Append(", "); }
    void CloseStruct(int /*level*/) { _text.Append("}"); }

    Walk OpenList(const MetaList& /*value*/, int /*level*/) {
        _text.Append("[");
        return Walk::Into;
    }
    void CloseItem(bool /*isLast*/) { _text.Append(", "); }
    void CloseList(int /*level*/) { _text.Append("]"); }
};

void Write(const MetaObject* value, TextWriter& text, int level) {
    if (!value) {
        throw Zelmar::ZelmarException("Invalid MetaObject passed to Format in PythonFormatter");
    }
    WriteValue<PythonWriter>(text, value, level);
}

}  // namespace

PythonFormatter::PythonFormatter() : Formatter("python") {
    _description = "Print the output as Python syntax suitable for eval().";
}

bool PythonFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                             FormatParameters& /*parameters*/, DisplayContext& context,
                             std::ostream& stream) {
    TextWriter text(stream, context);
    Write(output->GetRootObject().get(), text, 2);
    text.EndLine();
    text.Finish();
    return true;
}

void PythonFormatter::Format(const std::shared_ptr<MetaObject>& value, std::ostream& stream,
                             int level) const {
    TextWriter text(stream);
    Write(value.get(), text, level);
    text.Finish();
}

bool PythonFormatter::IsAllAscii(const std::string& text) {
    return std::ranges::none_of(text, [](char c) { return (c & 0x80) != 0; });
}

}  // namespace AutoCli
