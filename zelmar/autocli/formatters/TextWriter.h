#pragma once

#include <zelmar/autocli/formatters/Formatter.h>

#include <algorithm>
#include <array>
#include <iosfwd>
#include <string_view>

/// Gathers text for a stream, so that many small pieces become few writes. It holds one small
/// buffer, however long the text or a line of it. What is gathered reaches the stream at the end of
/// a line, when the buffer is full, and by `Finish`, which belongs at the end of every use.
///
/// The end of a line flushes the stream. Where a `BlockOutput` puts off flushes anyway, lines are
/// gathered too, and one flush stands for all.
class TextWriter {
public:
    /// What the context says of control characters and columns holds for all that is appended.
    explicit TextWriter(std::ostream& out, const AutoCli::DisplayContext& context = {});
    TextWriter(const TextWriter&) = delete;
    TextWriter& operator=(const TextWriter&) = delete;

    /// Texts, one behind the other.
    template <class... Texts>
    void Append(const Texts&... texts) {
        AppendAll(std::string_view(texts)...);
    }
    void AppendNumber(long number);

    void AppendBlanks(size_t count) {
        if (count > _buffer.size() - _used) {
            AppendManyBlanks(count);
            return;
        }
        std::fill_n(_buffer.data() + _used, count, ' ');
        _used += count;
    }
    /// Three blanks for each level; none below level 1.
    void AppendIndent(int level) { AppendBlanks(level > 0 ? 3 * static_cast<size_t>(level) : 0); }

    void EndLine() {
        Append("\n");
        if (_linesGather) {
            _flushWanted = true;
        } else {
            WriteLine();
        }
    }

    void Finish();

    /// The room that a text takes once it is appended: bytes, or columns of the terminal.
    [[nodiscard]] size_t WidthOf(std::string_view text) const {
        return _showsControls || _countsColumns ? ShownWidthOf(text) : text.size();
    }

private:
    template <class... Views>
    void AppendAll(Views... texts) {
        if (_showsControls || (... + texts.size()) > _buffer.size() - _used) {
            (AppendSlowly(texts), ...);
            return;
        }
        char* end = _buffer.data() + _used;
        ((end += texts.copy(end, texts.size())), ...);
        _used = static_cast<size_t>(end - _buffer.data());
    }

    void AppendSlowly(std::string_view text);
    void AppendLong(std::string_view text);
    void AppendManyBlanks(size_t count);
    void Write();
    void WriteLine();
    [[nodiscard]] size_t ShownWidthOf(std::string_view text) const;

    std::ostream& _out;
    const bool _linesGather;
    const bool _showsControls;
    const bool _countsColumns;
    bool _flushWanted = false;
    size_t _used = 0;
    std::array<char, 4096> _buffer;  // not initialised: it is read only as far as it was written
};
