#include <zelmar/autocli/formatters/Escape.h>
#include <zelmar/autocli/formatters/ValueWalk.h>
#include <zelmar/autocli/formatters/XmlFormatter.h>

using MetaObj::MetaType;

namespace AutoCli {

namespace {

constexpr EscapeTable MakeEscapes() {
    EscapeTable escapes;
    escapes.Set('&', "&amp;");
    escapes.Set('<', "&lt;");
    escapes.Set('>', "&gt;");
    escapes.Set('%', "&#37;");
    escapes.Set('"', "&quot;");
    escapes.Set('\'', "&apos;");
    return escapes;
}

constexpr EscapeTable escapes = MakeEscapes();

void AppendSanitized(TextWriter& text, std::string_view value) {
    Escape(value, escapes, [&text](std::string_view piece) { text.Append(piece); });
}

std::string_view ItemWord(MetaType type) {
    switch (type) {
        case MetaType::Bool:
            return "boolean";
        case MetaType::Int:
            return "integer";
        case MetaType::String:
            return "string";
        case MetaType::List:
            return "list";
        case MetaType::Struct:
            return "structure";
    }
    return "";
}

class XmlWriter : public ValueWriter {
public:
    static constexpr int fieldDepth = 2;
    static constexpr int itemDepth = 2;

    using ValueWriter::ValueWriter;

    void Bool(bool value, int level) {
        _text.AppendIndent(level);
        WriteLine("<boolean>", value ? "true" : "false", "</boolean>");
    }
    void Int(long value, int level) {
        _text.AppendIndent(level);
        _text.Append("<integer>");
        _text.AppendNumber(value);
        WriteLine("</integer>");
    }
    void String(const std::string& value, int level) {
        _text.AppendIndent(level);
        _text.Append("<string>");
        AppendSanitized(_text, value);
        WriteLine("</string>");
    }

    void OpenStruct(const MetaObj::MetaStruct& value, int level) {
        _text.AppendIndent(level);
        OpenTag("<structure typeName=\"", value.GetTypeName());
    }
    bool OpenField(const AllFields& field, int level) {
        _text.AppendIndent(level);
        OpenTag("   <field name=\"", field.Name());
        return true;
    }
    void CloseField(bool /*isLast*/, int level) {
        _text.AppendIndent(level);
        WriteLine("   </field>");
    }
    void CloseStruct(int level) {
        _text.AppendIndent(level);
        WriteLine("</structure>");
    }

    bool OpenList(const MetaObj::MetaList& value, int level) {
        _text.AppendIndent(level);
        OpenTag("<list type=\"", ItemWord(value.GetListType()));
        return true;
    }
    void CloseList(int level) {
        _text.AppendIndent(level);
        WriteLine("</list>");
    }

    void Unreadable(MetaType kind) {
        if (kind == MetaType::Bool) {
            WriteLine("<!-- Error reading a bool -->");
        } else {
            ValueWriter::Unreadable(kind);
        }
    }
    void Unknown() { WriteLine("Error Only simple int, bool, string and struct output supported"); }

private:
    void OpenTag(std::string_view tag, std::string_view attribute) {
        _text.Append(tag);
        AppendSanitized(_text, attribute);
        WriteLine("\">");
    }
};

// What stands in front of the value.
void WriteHead(std::ostream& stream, const FormatParameters& parameters) {
    TextWriter text(stream);
    text.Append("<?xml version=\"1.0\"?>");
    text.EndLine();
    if (parameters.HasParameter("stylesheet")) {
        text.Append(R"(<?xml-stylesheet type="text/xsl" href=")",
                    parameters.GetParameter("stylesheet"), R"("?>)");
        text.EndLine();
    }
    text.Append("<output xmlns:kelvash=\"http://norvane.example/Products/TRELL/5.0/kelvash\">");
    text.EndLine();
    text.Append("   <meta-data>");
    text.EndLine();
    for (const auto& [key, value] : parameters.GetParameters()) {
        text.Append("      <meta-data-field name=\"");
        AppendSanitized(text, key);
        text.Append("\" value=\"");
        AppendSanitized(text, value);
        text.Append("\"/>");
        text.EndLine();
    }
    text.Append("   </meta-data>");
    text.EndLine();
    text.Append("   <root>");
    text.EndLine();
    text.Finish();
}

}  // namespace

XmlFormatter::XmlFormatter() : Formatter("xml") {
    _description =
        "Print an XML document to the screen representing the output for a given command";
    _params = {{"stylesheet", "The file name or URL to a stylesheet for this document.  "}};
}

bool XmlFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                          FormatParameters& parameters, DisplayContext& /*context*/,
                          std::ostream& stream) {
    WriteHead(stream, parameters);
    if (const auto root = output->GetRootObject()) {
        Format(root, stream, 2);
    }
    stream << "   </root>" << std::endl << "</output>" << std::endl;
    return true;
}

void XmlFormatter::Format(const std::shared_ptr<MetaObj::MetaObject>& value, std::ostream& stream,
                          int level) const {
    WriteValue<XmlWriter>(stream, value.get(), level);
}

std::string SantizeString(std::string text) {
    std::string sanitized;
    sanitized.reserve(text.size());
    Escape(text, escapes, [&sanitized](std::string_view piece) { sanitized.append(piece); });
    return sanitized;
}

}  // namespace AutoCli
