#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/formatters/Escape.h>
#include <zelmar/autocli/formatters/PythonFormatter.h>
#include <zelmar/autocli/formatters/ValueWalk.h>

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

    void OpenStruct(const MetaObj::MetaStruct& /*value*/, int /*level*/) { _text.Append("{"); }
    bool OpenField(const AllFields& field, int /*level*/) {
        _text.Append("\"", field.Name(), "\": ");
        return true;
    }
    void CloseField(bool /*isLast*/, int /*level*/) { _text.Append(", "); }
    void CloseStruct(int /*level*/) { _text.Append("}"); }

    bool OpenList(const MetaObj::MetaList& /*value*/, int /*level*/) {
        _text.Append("[");
        return true;
    }
    void CloseItem(bool /*isLast*/) { _text.Append(", "); }
    void CloseList(int /*level*/) { _text.Append("]"); }
};

}  // namespace

PythonFormatter::PythonFormatter() : Formatter("python") {
    _description = "Print the output as Python syntax suitable for eval().";
}

bool PythonFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                             FormatParameters& /*parameters*/, DisplayContext& /*context*/,
                             std::ostream& stream) {
    Format(output->GetRootObject(), stream, 2);
    stream << std::endl;
    return true;
}

void PythonFormatter::Format(const std::shared_ptr<MetaObj::MetaObject>& value,
                             std::ostream& stream, int level) const {
    if (!value) {
        throw Zelmar::ZelmarException("Invalid MetaObject passed to Format in PythonFormatter");
    }
    WriteValue<PythonWriter>(stream, value.get(), level);
}

bool PythonFormatter::IsAllAscii(const std::string& text) {
    return std::ranges::none_of(text, [](char c) { return (c & 0x80) != 0; });
}

}  // namespace AutoCli
