#include <zelmar/autocli/formatters/Escape.h>
#include <zelmar/autocli/formatters/ValueWriter.h>
#include <zelmar/autocli/formatters/XmlFormatter.h>

using MetaObj::AllFields;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::MetaType;
using MetaObj::Walk;

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

    void OpenStruct(const MetaStruct& value, int level) {
        _text.AppendIndent(level);
        OpenTag("<structure typeName=\"", value.GetTypeName());
    }
    Walk OpenField(const AllFields& field, int level) {
        _text.AppendIndent(level);
        OpenTag("   <field name=\"", field.Name());
        return Walk::Into;
    }
    void CloseField(bool /*isLast*/, int level) {
        _text.AppendIndent(level);
        WriteLine("   </field>");
    }
    void CloseStruct(int level) {
        _text.AppendIndent(level);
        WriteLine("</structure>");
    }

    Walk OpenList(const MetaList& value, int level) {
        _text.AppendIndent(level);
        OpenTag("<list type=\"", ItemWord(value.GetListType()));
        return Walk::Into;
    }
    void CloseList(int level) {
        _text.AppendIndent(level);
        WriteLine("</list>");
    }

    void Other(const MetaObject* value) {
        std::string_view complaint = ComplaintAbout(value);
        if (complaint.empty()) {
            complaint = "Error Only simple int, bool, string and struct output supported";
        } else if (value->GetType() == MetaType::Bool) {
            complaint = "<!-- Error reading a bool -->";
        }
        WriteLine(complaint);
    }

private:
    void OpenTag(std::string_view tag, std::string_view attribute) {
        _text.Append(tag);
        AppendSanitized(_text, attribute);
        WriteLine("\">");
    }
};

// What stands in front of the value.
void WriteHead(TextWriter& text, const FormatParameters& parameters) {
    const auto writeLine = [&text](const auto&... pieces) {
        text.Append(pieces...);
        text.EndLine();
    };
    writeLine("<?xml version=\"1.0\"?>");
    if (parameters.HasParameter("stylesheet")) {
        writeLine(R"(<?xml-stylesheet type="text/xsl" href=")",
                  parameters.GetParameter("stylesheet"), R"("?>)");
    }
    writeLine("<output xmlns:kelvash=\"http://norvane.example/Products/TRELL/5.0/kelvash\">");
    writeLine("   <meta-data>");
    for (const auto& [key, value] : parameters.GetParameters()) {
        text.Append("      <meta-data-field name=\"");
        AppendSanitized(text, key);
        text.Append("\" value=\"");
        AppendSanitized(text, value);
        writeLine("\"/>");
    }
    writeLine("   </meta-data>");
    writeLine("   <root>");
}

}  // namespace

XmlFormatter::XmlFormatter() : Formatter("xml") {
    _description =
        "Print an XML document to the screen representing the output for a given command";
    _params = {{"stylesheet", "The file name or URL to a stylesheet for this document.  "}};
}

bool XmlFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                          FormatParameters& parameters, DisplayContext& context,
                          std::ostream& stream) {
    TextWriter text(stream, context);
    WriteHead(text, parameters);
    if (const auto root = output->GetRootObject()) {
        WriteValue<XmlWriter>(text, root.get(), 2);
    }
    text.Append("   </root>");
    text.EndLine();
    text.Append("</output>");
    text.EndLine();
    text.Finish();
    return true;
}

void XmlFormatter::Format(const std::shared_ptr<MetaObject>& value, std::ostream& stream,
                          int level) const {
    TextWriter text(stream);
    WriteValue<XmlWriter>(text, value.get(), level);
    text.Finish();
}

std::string SantizeString(std::string text) {
    std::string sanitized;
    sanitized.reserve(text.size());
    Escape(text, escapes, [&sanitized](std::string_view piece) { sanitized.append(piece); });
    return sanitized;
}

}  // namespace AutoCli
