#pragma once

#include <array>
#include <ostream>
#include <string_view>

/// Gathers what a formatter writes, so that many small pieces become few writes. `Finish` belongs
/// at the end: it writes the rest and flushes the stream.
class Text {
public:
    explicit Text(std::ostream& out) : _out(out) {}
    Text(const Text&) = delete;
    Text& operator=(const Text&) = delete;

    template <class... Pieces>
    void Append(const Pieces&... pieces) {
        (AppendPiece(pieces), ...);
    }

    void Finish() {
        Write({_buffer.data(), _used});
        _out.flush();
    }

private:
    void AppendPiece(std::string_view piece) {
        if (piece.size() > _buffer.size() - _used) {
            Write({_buffer.data(), _used});
            _used = 0;
        }
        if (piece.size() > _buffer.size()) {
            Write(piece);
        } else {
            _used += piece.copy(_buffer.data() + _used, piece.size());
        }
    }

    void Write(std::string_view text) {
        _out.write(text.data(), static_cast<std::streamsize>(text.size()));
    }

    std::ostream& _out;
    size_t _used = 0;
    std::array<char, 4096> _buffer;  // not initialised: it is read only as far as it was written
};
