#pragma once

#include <string_view>

/// Hands each piece of `text` between separators to `piece`, in order, as a view into `text`.
/// A separator at the end opens no further piece and an empty text has none; any other empty piece
/// counts: "a,,b" has three, "," has one.
template <class Piece>
void ForEachPiece(std::string_view text, char separator, Piece piece) {
    while (!text.empty()) {
        const size_t end = text.find(separator);
        piece(text.substr(0, end));
        text = end == std::string_view::npos ? std::string_view() : text.substr(end + 1);
    }
}
