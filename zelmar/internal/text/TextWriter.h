#pragma once

#include <array>
#include <iosfwd>
#include <string_view>

/// Gathers text for a stream, so that many small pieces become few writes. It holds one small
/// buffer, however long the text or a line of it. What is gathered reaches the stream at the end of
/// a line, when the buffer is full, and by `Write`, which belongs at the end of every use.
class TextWriter {
public:
    explicit TextWriter(std::ostream& out) : _out(out) {}
    TextWriter(const TextWriter&) = delete;
    TextWriter& operator=(const TextWriter&) = delete;

    void Append(std::string_view text) {
        if (text.size() > _buffer.size() - _used) {
            AppendPieces(text);
            return;
        }
        _used += text.copy(_buffer.data() + _used, text.size());
    }
    void Append(long number);

    void AppendBlanks(size_t count);
    /// Three blanks for each level; none below level 1.
    void AppendIndent(int level) { AppendBlanks(level > 0 ? 3 * static_cast<size_t>(level) : 0); }

    /// A line feed. All text goes to the stream, which is flushed.
    void EndLine();

    void Write();

private:
    void AppendPieces(std::string_view text);

    std::ostream& _out;
    size_t _used = 0;
    std::array<char, 4096> _buffer;  // not initialised: it is read only as far as it was written
};
