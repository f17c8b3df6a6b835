#pragma once

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
    explicit TextWriter(std::ostream& out);
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

private:
    template <class... Views>
    void AppendAll(Views... texts) {
        if ((... + texts.size()) > _buffer.size() - _used) {
            (AppendLong(texts), ...);
            return;
        }
        char* end = _buffer.data() + _used;
        ((end += texts.copy(end, texts.size())), ...);
        _used = static_cast<size_t>(end - _buffer.data());
    }

    void AppendLong(std::string_view text);
    void AppendManyBlanks(size_t count);
    void Write();
    void WriteLine();

    std::ostream& _out;
    const bool _linesGather;
    bool _flushWanted = false;
    size_t _used = 0;
    std::array<char, 4096> _buffer;  // not initialised: it is read only as far as it was written
};
