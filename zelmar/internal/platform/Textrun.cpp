#include <zelmar/internal/Utf8.h>
#include <zelmar/internal/platform/Textrun.h>

#include <cstdlib>
#include <cstring>
#include <new>
#include <string>
#include <string_view>

namespace {

std::string_view ViewOf(const char* text, int length) {
    return length < 0 ? std::string_view(text)
                      : std::string_view(text, static_cast<size_t>(length));
}

}  // namespace

bool Textrun_IsBufferValid(const char* text, int length, int /*encoding*/) {
    std::string_view rest = ViewOf(text, length);
    while (!rest.empty()) {
        const Utf8Sequence sequence = LeadingSequence(rest);
        if (!sequence.isWellFormed) {
            return false;
        }
        rest.remove_prefix(sequence.length);
    }
    return true;
}

char* Textrun_EscapeBuffer(const char* text, int length, int /*encoding*/) {
    constexpr char digits[] = "0123456789abcdef";
    std::string escaped;
    for (std::string_view rest = ViewOf(text, length); !rest.empty();) {
        const Utf8Sequence sequence = LeadingSequence(rest);
        for (const char c : rest.substr(0, sequence.length)) {
            const auto byte = static_cast<unsigned char>(c);
            if (sequence.isWellFormed) {
                escaped += c;
            } else {
                escaped.append({'\\', 'x', digits[byte >> 4], digits[byte & 0xF]});
            }
        }
        rest.remove_prefix(sequence.length);
    }
    char* copy = strdup(escaped.c_str());
    if (!copy) {
        throw std::bad_alloc();
    }
    return copy;
}
