#pragma once

#include <algorithm>
#include <array>
#include <cstdint>
#include <string_view>

namespace AutoCli {

/// What stands for each byte that a notation cannot hold as it is.
class EscapeTable {
public:
    /// `text` is not empty and at most seven bytes long.
    constexpr void Set(unsigned char byte, std::string_view text) {
        Entry& entry = _entries[byte];
        std::ranges::copy(text, entry.text.begin());
        entry.size = static_cast<uint8_t>(text.size());
    }

    /// Empty for a byte that stands for itself.
    [[nodiscard]] constexpr std::string_view operator[](char byte) const {
        const Entry& entry = _entries[static_cast<unsigned char>(byte)];
        return {entry.text.data(), entry.size};
    }

private:
    struct Entry {
        std::array<char, 7> text{};
        uint8_t size = 0;
    };
    std::array<Entry, 256> _entries{};
};

/// Hands the escaped form of `text` to `append`, in pieces as long as they come.
template <class Append>
void Escape(std::string_view text, const EscapeTable& table, Append append) {
    size_t start = 0;
    for (size_t i = 0; i < text.size(); ++i) {
        if (const std::string_view escape = table[text[i]]; !escape.empty()) {
            append(text.substr(start, i - start));
            append(escape);
            start = i + 1;
        }
    }
    append(text.substr(start));
}

}  // namespace AutoCli
