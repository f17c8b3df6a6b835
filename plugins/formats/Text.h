#pragma once

#include <ostream>
#include <string_view>

/// Writes to the buffer of a stream, without what the stream does around each piece. The engine
/// gathers the pieces in blocks.
class Text {
public:
    explicit Text(std::ostream& out) : _out(out) {}

    template <class... Pieces>
    void Append(const Pieces&... pieces) {
        (AppendPiece(pieces), ...);
    }

private:
    void AppendPiece(std::string_view piece) {
        const auto size = static_cast<std::streamsize>(piece.size());
        if (_out.rdbuf()->sputn(piece.data(), size) != size) {
            _out.setstate(std::ios_base::badbit);
        }
    }

    std::ostream& _out;
};
