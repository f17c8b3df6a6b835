#include <zelmar/internal/ControlCharacters.h>
#include <zelmar/internal/Utf8.h>

#include <array>
#include <cstdio>

namespace {

struct Range {
    std::string_view lead;  // the bytes ahead of the last one
    unsigned char first;
    unsigned char last;
    unsigned code;  // of the first
};

constexpr std::array<Range, 5> ranges = {{
    {"", 0x00, 0x1f, 0x00},
    {"", 0x7f, 0x7f, 0x7f},
    {"\xc2", 0x80, 0x9f, 0x80},
    {"\xe2\x80", 0xa8, 0xae, 0x2028},
    {"\xe2\x81", 0xa6, 0xa9, 0x2066},
}};

}  // namespace

ControlCharacter FindControlCharacter(std::string_view text) {
    for (const auto& [lead, first, last, code] : ranges) {
        if (text.size() > lead.size() && text.starts_with(lead)) {
            const auto byte = static_cast<unsigned char>(text[lead.size()]);
            if (first <= byte && byte <= last) {
                return {lead.size() + 1, code + byte - first};
            }
        }
    }
    return {};
}

std::string ShowControlCharacters(std::string_view text, std::string_view kept) {
    std::string shown;
    while (!text.empty()) {
        const Utf8Sequence sequence = LeadingSequence(text);
        auto [length, code] = FindControlCharacter(text);
        if (const auto byte = static_cast<unsigned char>(text[0]);
            !sequence.isWellFormed && byte >= 0x80 && byte <= 0x9f) {
            length = 1;
            code = byte;
        }
        if (length == 0 || kept.find(text[0]) != std::string_view::npos) {
            const size_t passed = sequence.isWellFormed ? sequence.length : 1;
            shown += text.substr(0, passed);
            text.remove_prefix(passed);
            continue;
        }
        char escape[16];
        std::snprintf(escape, sizeof escape, code < 0x100 ? "\\x%02x" : "\\u%04x", code);
        shown += escape;
        text.remove_prefix(length);
    }
    return shown;
}
