#include "Delimited.h"

#include <algorithm>

#include "Rows.h"
#include "Text.h"

using AutoCli::EscapeTable;

namespace {

constexpr EscapeTable doubledQuotes = [] {
    EscapeTable escapes;
    escapes.Set('"', "\"\"");
    return escapes;
}();

constexpr EscapeTable backslashes = [] {
    EscapeTable escapes;
    escapes.Set('\t', "\\t");
    escapes.Set('\n', "\\n");
    escapes.Set('\r', "\\r");
    escapes.Set('\\', "\\\\");
    return escapes;
}();

// How the two notations differ.
class CsvCells {
public:
    static constexpr std::string_view separator = ",";
    static constexpr std::string_view lineEnd = "\r\n";

    static void AppendText(Text& out, std::string_view text, bool isOnly) {
        const bool isPlain = std::ranges::none_of(
            text, [](char c) { return c == ',' || c == '"' || c == '\r' || c == '\n'; });
        if (isPlain && !(isOnly && text.empty())) {  // readers pass over an empty line
            out.Append(text);
            return;
        }
        out.Append("\"");
        Escape(text, doubledQuotes, [&out](std::string_view piece) { out.Append(piece); });
        out.Append("\"");
    }

    static void AppendNested(Text& out, const MetaObj::MetaObject* value) {
        out.Append("\"");
        AutoCli::AutoCli_WriteJsonText(value, [&out](std::string_view json) {
            Escape(json, doubledQuotes, [&out](std::string_view piece) { out.Append(piece); });
        });
        out.Append("\"");
    }
};

class TsvCells {
public:
    static constexpr std::string_view separator = "\t";
    static constexpr std::string_view lineEnd = "\n";

    static void AppendText(Text& out, std::string_view text, bool /*isOnly*/) {
        Escape(text, backslashes, [&out](std::string_view piece) { out.Append(piece); });
    }

    static void AppendNested(Text& out, const MetaObj::MetaObject* value) {
        AutoCli::AutoCli_WriteJsonText(
            value, [&out](std::string_view json) { AppendText(out, json, false); });
    }
};

template <class Cells>
bool Write(const CallSpec::Output& output, const AutoCli::FormatParameters& parameters,
           std::ostream& stream) {
    Rows rows(output, parameters, Rows::Units::Off);
    Text text(stream);
    const auto& columns = rows.Columns();
    if (columns.empty()) {
        return true;
    }
    const auto separate = [&](size_t column) {
        text.Append(column + 1 < columns.size() ? Cells::separator : Cells::lineEnd);
    };
    if (ShowsHeader(parameters)) {
        for (size_t column = 0; column < columns.size(); ++column) {
            Cells::AppendText(text, columns[column], columns.size() == 1);
            separate(column);
        }
    }
    for (size_t row = 0; row < rows.Count(); ++row) {
        for (size_t column = 0; column < columns.size(); ++column) {
            const auto& cell = rows.Cell(row, column);
            if (IsNested(cell)) {
                Cells::AppendNested(text, cell.get());
            } else {
                Cells::AppendText(text, rows.TextOf(row, column, cell), columns.size() == 1);
            }
            separate(column);
        }
    }
    text.Finish();
    return true;
}

}  // namespace

CsvFormatter::CsvFormatter() : Formatter("csv") {
    _description =
        "Print comma-separated values, for spreadsheets: a list of structs with a row each.";
    _params = RowParameters(Rows::Units::Off);
}

bool CsvFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                          AutoCli::FormatParameters& parameters,
                          AutoCli::DisplayContext& /*context*/, std::ostream& stream) {
    return Write<CsvCells>(*output, parameters, stream);
}

TsvFormatter::TsvFormatter() : Formatter("tsv") {
    _description =
        "Print tab-separated values, for cut and awk: a list of structs with a line each.";
    _params = RowParameters(Rows::Units::Off);
}

bool TsvFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                          AutoCli::FormatParameters& parameters,
                          AutoCli::DisplayContext& /*context*/, std::ostream& stream) {
    return Write<TsvCells>(*output, parameters, stream);
}
