#include <zelmar/autocli/formatters/BlockOutput.h>
#include <zelmar/autocli/formatters/Columns.h>
#include <zelmar/autocli/formatters/TextWriter.h>

#include <charconv>
#include <limits>

TextWriter::TextWriter(std::ostream& out, const AutoCli::DisplayContext& context)
    : _out(out),
      _linesGather(dynamic_cast<BlockOutput*>(&out) != nullptr),
      _showsControls(context.showControls),
      _countsColumns(context.countColumns) {}

void TextWriter::AppendNumber(long number) {
    std::array<char, std::numeric_limits<long>::digits10 + 2> digits;  // and the sign
    const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), number).ptr;
    Append(std::string_view(digits.data(), static_cast<size_t>(end - digits.data())));
}

void TextWriter::Finish() {
    Write();
    if (_flushWanted) {
        _out.flush();
    }
}

size_t TextWriter::ShownWidthOf(std::string_view text) const {
    if (_showsControls) {
        const std::string shown = AutoCli::AutoCli_ShowControls(text);
        return _countsColumns ? ColumnsOf(shown) : shown.size();
    }
    return ColumnsOf(text);
}

void TextWriter::AppendSlowly(std::string_view text) {
    if (_showsControls) {
        AppendLong(AutoCli::AutoCli_ShowControls(text));
    } else {
        AppendLong(text);
    }
}

void TextWriter::AppendLong(std::string_view text) {
    if (text.size() > _buffer.size() - _used) {
        Write();
    }
    if (text.size() > _buffer.size()) {
        _out.write(text.data(), static_cast<std::streamsize>(text.size()));
    } else {
        _used += text.copy(_buffer.data() + _used, text.size());
    }
}

void TextWriter::AppendManyBlanks(size_t count) {
    while (count > 0) {
        if (_used == _buffer.size()) {
            Write();
        }
        const size_t piece = std::min(count, _buffer.size() - _used);
        AppendBlanks(piece);
        count -= piece;
    }
}

void TextWriter::Write() {
    _out.write(_buffer.data(), static_cast<std::streamsize>(_used));
    _used = 0;
}

void TextWriter::WriteLine() {
    Write();
    _out.flush();
}
