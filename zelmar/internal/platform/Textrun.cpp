#include <zelmar/internal/platform/Textrun.h>

#include <cstdlib>
#include <cstring>
#include <new>
#include <string>
#include <string_view>

namespace {

// One row a form of well-formed sequences: the lead bytes, and the range of the second byte, which
// is narrower where the full range would admit overlong forms, surrogates or numbers past the end
// (Unicode Standard, table 3-7). Bytes after the second always lie in 80..BF.
struct SequenceForm {
    unsigned char firstLead, lastLead;
    unsigned char firstSecond, lastSecond;
    size_t length;
};

constexpr SequenceForm forms[] = {
    {0x00, 0x7F, 0x00, 0x00, 1}, {0xC2, 0xDF, 0x80, 0xBF, 2}, {0xE0, 0xE0, 0xA0, 0xBF, 3},
    {0xE1, 0xEC, 0x80, 0xBF, 3}, {0xED, 0xED, 0x80, 0x9F, 3}, {0xEE, 0xEF, 0x80, 0xBF, 3},
    {0xF0, 0xF0, 0x90, 0xBF, 4}, {0xF1, 0xF3, 0x80, 0xBF, 4}, {0xF4, 0xF4, 0x80, 0x8F, 4},
};

bool Fits(const SequenceForm& form, std::string_view text) {
    const auto byte = [text](size_t i) { return static_cast<unsigned char>(text[i]); };
    if (byte(0) < form.firstLead || byte(0) > form.lastLead || text.size() < form.length) {
        return false;
    }
    for (size_t i = 1; i < form.length; ++i) {
        const unsigned char first = i == 1 ? form.firstSecond : 0x80;
        const unsigned char last = i == 1 ? form.lastSecond : 0xBF;
        if (byte(i) < first || byte(i) > last) {
            return false;
        }
    }
    return true;
}

// Bytes of the well-formed sequence at the front of a text that is not empty; 0 when there is none.
size_t LeadingSequence(std::string_view text) {
    for (const SequenceForm& form : forms) {
        if (Fits(form, text)) {
            return form.length;
        }
    }
    return 0;
}

std::string_view ViewOf(const char* text, int length) {
    return length < 0 ? std::string_view(text)
                      : std::string_view(text, static_cast<size_t>(length));
}

}  // namespace

bool Textrun_IsBufferValid(const char* text, int length, int /*encoding*/) {
    std::string_view rest = ViewOf(text, length);
    while (!rest.empty()) {
        const size_t sequence = LeadingSequence(rest);
        if (sequence == 0) {
            return false;
        }
        rest.remove_prefix(sequence);
    }
    return true;
}

char* Textrun_EscapeBuffer(const char* text, int length, int /*encoding*/) {
    constexpr char digits[] = "0123456789abcdef";
    std::string escaped;
    for (std::string_view rest = ViewOf(text, length); !rest.empty();) {
        const size_t sequence = LeadingSequence(rest);
        if (sequence == 0) {
            const auto byte = static_cast<unsigned char>(rest[0]);
            escaped.append({'\\', 'x', digits[byte >> 4], digits[byte & 0xF]});
        } else {
            escaped.append(rest.substr(0, sequence));
        }
        rest.remove_prefix(sequence == 0 ? 1 : sequence);
    }
    char* copy = strdup(escaped.c_str());
    if (!copy) {
        throw std::bad_alloc();
    }
    return copy;
}
