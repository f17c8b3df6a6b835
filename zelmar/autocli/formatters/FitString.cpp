#include <zelmar/autocli/formatters/FitString.h>
#include <zelmar/autocli/formatters/FitText.h>
#include <zelmar/internal/Split.h>

#include <algorithm>

namespace {

void AppendIndentation(const Fit& fit, TextWriter& out) {
    out.AppendBlanks(static_cast<size_t>(std::max(fit.indent, 1)));
}

// One line of text in the room between the two columns.
void FitLine(std::string_view text, const Fit& fit, TextWriter& out) {
    const long room = static_cast<long>(fit.width) - fit.indent;
    if (room <= 0 || out.WidthOf(text) <= static_cast<size_t>(room)) {
        out.Append(text);
        return;
    }
    const char lineBreak = fit.breakChar == 0 ? ' ' : fit.breakChar;
    long left = room;
    bool isFirst = true;
    ForEachPiece(text, ' ', [&](std::string_view word) {
        const long taken =
            static_cast<long>(out.WidthOf(word)) + 1;  // each counts a blank behind it
        left -= taken;
        if (left < 0) {
            out.Append(std::string_view(&lineBreak, 1));
            out.EndLine();
            AppendIndentation(fit, out);
            left = room - taken;
        } else if (!isFirst) {
            out.AppendBlanks(1);
        }
        out.Append(word);
        isFirst = false;
    });
}

}  // namespace

void FitText(std::string_view text, const Fit& fit, TextWriter& out) {
    bool isFirst = true;
    const auto fitLine = [&](std::string_view line) {
        if (!isFirst && !fit.endLine) {
            out.EndLine();
        }
        if (!isFirst || !fit.skipFirstIndent) {
            AppendIndentation(fit, out);
        }
        FitLine(line, fit, out);
        if (fit.endLine) {
            out.EndLine();
        }
        isFirst = false;
    };
    if (fit.splitLines) {
        ForEachPiece(text, '\n', fitLine);
    } else {
        fitLine(text);
    }
}

void AutoCli::AutoCli_FitString(const int& indent, const int& width, const std::string& text,
                                bool skipFirstIndent, std::ostream& out, bool endLine,
                                char breakChar, bool splitLines) {
    TextWriter writer(out);
    FitText(text, {indent, width, skipFirstIndent, endLine, breakChar, splitLines}, writer);
    writer.Finish();
}
