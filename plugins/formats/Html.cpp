#include "Html.h"

#include "Rows.h"
#include "Text.h"

using MetaObj::AllFields;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::Walk;

namespace {

constexpr AutoCli::EscapeTable escapes = [] {
    AutoCli::EscapeTable table;
    table.Set('&', "&amp;");
    table.Set('<', "&lt;");
    table.Set('>', "&gt;");
    table.Set('"', "&quot;");
    table.Set('\'', "&#39;");
    table.Set('\r', "&#13;");
    table.Set('\0', "\xEF\xBF\xBD");  // what readers make of it
    return table;
}();

void AppendText(Text& out, std::string_view text) {
    AutoCli::AutoCli_RepairUtf8(text, [&out](std::string_view sound) {
        Escape(sound, escapes, [&out](std::string_view piece) { out.Append(piece); });
    });
}

class HtmlWriter {
public:
    static constexpr int fieldDepth = 0;
    static constexpr int itemDepth = 0;

    explicit HtmlWriter(Text& text) : _text(text) {}

    static AllFields FieldsOf(const MetaStruct& value) { return AllFields(value); }

    void Bool(bool value, int /*level*/) { _text.Append(value ? "true" : "false"); }
    void Int(long value, int /*level*/) { _text.Append(std::to_string(value)); }
    void String(const std::string& value, int /*level*/) { AppendText(_text, value); }
    void Other(const MetaObject* /*value*/) {}

    void OpenStruct(const MetaStruct& /*value*/, int /*level*/) { _text.Append("<dl>"); }
    Walk OpenField(const AllFields& field, int /*level*/) {
        _text.Append("<dt>");
        AppendText(_text, field.Name());
        _text.Append("</dt><dd>");
        return Walk::Into;
    }
    void CloseField(bool /*isLast*/, int /*level*/) { _text.Append("</dd>"); }
    void CloseStruct(int /*level*/) { _text.Append("</dl>"); }

    Walk OpenList(const MetaList& /*value*/, int /*level*/) {
        _text.Append("<ul>");
        return Walk::Into;
    }
    void OpenItem(int /*level*/) { _text.Append("<li>"); }
    void CloseItem(bool /*isLast*/) { _text.Append("</li>"); }
    void CloseList(int /*level*/) { _text.Append("</ul>"); }

private:
    Text& _text;
};

constexpr std::string_view head =
    "<!DOCTYPE html>\n"
    "<html>\n"
    "<head>\n"
    "<meta charset=\"utf-8\">\n"
    "<title>Result</title>\n"
    "<style>\n"
    "body { font-family: sans-serif; }\n"
    "table { border-collapse: collapse; }\n"
    "th, td { border: 1px solid #bbb; padding: 0.2em 0.6em; text-align: left;"
    " vertical-align: top; white-space: pre-wrap; }\n"
    "td.number { text-align: right; }\n"
    "dl, ul { margin: 0; }\n"
    "</style>\n"
    "</head>\n"
    "<body>\n"
    "<table>\n";

constexpr std::string_view foot =
    "</table>\n"
    "</body>\n"
    "</html>\n";

void AppendHeader(Text& text, const std::vector<std::string>& columns) {
    text.Append("<tr>");
    for (const std::string& column : columns) {
        text.Append("<th>");
        AppendText(text, column);
        text.Append("</th>");
    }
    text.Append("</tr>\n");
}

void AppendCell(Text& text, Rows& rows, size_t row, size_t column) {
    const auto& cell = rows.Cell(row, column);
    const bool isNumber = cell && cell->GetType() == MetaObj::MetaType::Int;
    text.Append(isNumber ? "<td class=\"number\">" : "<td>");
    if (IsNested(cell)) {
        HtmlWriter writer(text);
        MetaObj::ValueWalk<HtmlWriter>(writer).Run(cell.get(), 0);
    } else {
        AppendText(text, rows.TextOf(row, column, cell));
    }
    text.Append("</td>");
}

}  // namespace

HtmlFormatter::HtmlFormatter() : Formatter("html") {
    _description = "Print a page with a table, for browsers: a list of structs with a row each.";
    _params = RowParameters(Rows::Units::On);
}

bool HtmlFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                           AutoCli::FormatParameters& parameters,
                           AutoCli::DisplayContext& /*context*/, std::ostream& stream) {
    Rows rows(*output, parameters, Rows::Units::On);
    Text text(stream);
    text.Append(head);
    if (ShowsHeader(parameters)) {
        AppendHeader(text, rows.Columns());
    }
    for (size_t row = 0; row < rows.Count(); ++row) {
        text.Append("<tr>");
        for (size_t column = 0; column < rows.Columns().size(); ++column) {
            AppendCell(text, rows, row, column);
        }
        text.Append("</tr>\n");
    }
    text.Append(foot);
    text.Finish();
    return true;
}
