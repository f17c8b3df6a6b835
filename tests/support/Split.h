#pragma once

#include <sstream>
#include <string>
#include <vector>

/// The pieces between the marks: a dense way to write a list of short texts.
inline std::vector<std::string> Split(const std::string& text, char mark) {
    std::vector<std::string> pieces;
    std::istringstream stream(text);
    for (std::string piece; std::getline(stream, piece, mark);) {
        pieces.push_back(piece);
    }
    return pieces;
}
