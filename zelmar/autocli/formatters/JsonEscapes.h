#pragma once

#include <zelmar/autocli/formatters/Escape.h>

namespace AutoCli {

/// What every text in JSON must escape (RFC 8259, section 7), by the short forms where there are
/// any, and besides the bytes from `firstHigh` on.
constexpr EscapeTable JsonEscapes(unsigned firstHigh = 0x100) {
    constexpr std::string_view digits = "0123456789abcdef";
    EscapeTable escapes;
    for (unsigned byte = 0; byte < 0x100; ++byte) {
        if (byte < 0x20 || byte >= firstHigh) {
            const char code[] = {'\\', 'u', '0', '0', digits[byte >> 4], digits[byte & 0xF]};
            escapes.Set(static_cast<unsigned char>(byte), {code, sizeof code});
        }
    }
    escapes.Set('"', "\\\"");
    escapes.Set('\\', "\\\\");
    escapes.Set('\b', "\\b");
    escapes.Set('\t', "\\t");
    escapes.Set('\n', "\\n");
    escapes.Set('\f', "\\f");
    escapes.Set('\r', "\\r");
    return escapes;
}

}  // namespace AutoCli
