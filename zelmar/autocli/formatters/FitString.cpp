#include <zelmar/autocli/formatters/FitString.h>
#include <zelmar/internal/Split.h>

#include <algorithm>
#include <ostream>
#include <string_view>

namespace AutoCli {

namespace {

// One line of text in the room between two columns.
class LineFitter {
public:
    LineFitter(int indent, long room, char breakChar, std::ostream& out)
        : _indentation(static_cast<size_t>(std::max(indent, 1)), ' '),
          _room(room),
          _break(breakChar == 0 ? ' ' : breakChar),
          _out(out) {}

    void WriteIndentation() { Write(_indentation); }

    void Fit(std::string_view text) {
        if (_room <= 0 || text.size() <= static_cast<size_t>(_room)) {
            Write(text);
            return;
        }
        long left = _room;
        bool isFirst = true;
        ForEachPiece(text, ' ', [&](std::string_view word) {
            const long taken = static_cast<long>(word.size()) + 1;  // each counts a blank behind it
            left -= taken;
            if (left < 0) {
                _out.put(_break) << std::endl;
                WriteIndentation();
                left = _room - taken;
            } else if (!isFirst) {
                _out.put(' ');
            }
            Write(word);
            isFirst = false;
        });
    }

private:
    void Write(std::string_view text) {
        _out.write(text.data(), static_cast<std::streamsize>(text.size()));
    }

    const std::string _indentation;
    const long _room;
    const char _break;
    std::ostream& _out;
};

}  // namespace

void AutoCli_FitString(const int& indent, const int& width, const std::string& text,
                       bool skipFirstIndent, std::ostream& out, bool endLine, char breakChar,
                       bool splitLines) {
    LineFitter fitter(indent, static_cast<long>(width) - indent, breakChar, out);
    bool isFirst = true;
    const auto fitLine = [&](std::string_view line) {
        if (!isFirst && !endLine) {
            out << std::endl;
        }
        if (!isFirst || !skipFirstIndent) {
            fitter.WriteIndentation();
        }
        fitter.Fit(line);
        if (endLine) {
            out << std::endl;
        }
        isFirst = false;
    };
    if (splitLines) {
        ForEachPiece(text, '\n', fitLine);
    } else {
        fitLine(text);
    }
}

}  // namespace AutoCli
