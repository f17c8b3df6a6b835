#include "Markdown.h"

#include <algorithm>

#include "Rows.h"
#include "Text.h"

namespace {

constexpr AutoCli::EscapeTable escapes = [] {
    AutoCli::EscapeTable table;
    for (const char c : std::string_view("\\`*_[]|~$#")) {
        const char escaped[] = {'\\', c};
        table.Set(static_cast<unsigned char>(c), {escaped, sizeof escaped});
    }
    table.Set('&', "&amp;");
    table.Set('<', "&lt;");
    table.Set('>', "&gt;");
    table.Set('\n', "<br>");
    table.Set('\r', "&#13;");
    return table;
}();

void AppendText(Text& out, std::string_view text) {
    AutoCli::AutoCli_RepairUtf8(text, [&out](std::string_view sound) {
        Escape(sound, escapes, [&out](std::string_view piece) { out.Append(piece); });
    });
}

void AppendCell(Text& out, Rows& rows, size_t row, size_t column) {
    const auto& cell = rows.Cell(row, column);
    if (IsNested(cell)) {
        AutoCli::AutoCli_WriteJsonText(cell.get(),
                                       [&out](std::string_view piece) { AppendText(out, piece); });
    } else {
        AppendText(out, rows.TextOf(row, column, cell));
    }
}

}  // namespace

MarkdownFormatter::MarkdownFormatter() : Formatter("markdown") {
    _description = "Print a table of Markdown, for documents: a list of structs with a row each.";
    _params = RowParameters(Rows::Units::On);
    std::erase_if(_params, [](const auto& parameter) { return parameter.name == "show-header"; });
}

bool MarkdownFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                               AutoCli::FormatParameters& parameters,
                               AutoCli::DisplayContext& /*context*/, std::ostream& stream) {
    Rows rows(*output, parameters, Rows::Units::On);
    Text text(stream);
    const size_t columns = rows.Columns().size();
    const auto writeLine = [&](auto appendCell) {
        text.Append("|");
        for (size_t column = 0; column < columns; ++column) {
            text.Append(" ");
            appendCell(column);
            text.Append(" |");
        }
        text.Append("\n");
    };
    if (columns == 0) {
        return true;
    }
    writeLine([&](size_t column) { AppendText(text, rows.Columns()[column]); });
    writeLine([&](size_t column) { text.Append(rows.IsNumber(column) ? "---:" : "---"); });
    for (size_t row = 0; row < rows.Count(); ++row) {
        writeLine([&](size_t column) { AppendCell(text, rows, row, column); });
    }
    text.Finish();
    return true;
}
