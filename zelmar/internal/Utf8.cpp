#include <zelmar/internal/Utf8.h>

#include <algorithm>

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

// How many bytes at the front of the text, the lead included, fit the form.
size_t FittingBytes(const SequenceForm& form, std::string_view text) {
    const size_t end = std::min(form.length, text.size());
    size_t count = 1;
    for (; count < end; ++count) {
        const auto byte = static_cast<unsigned char>(text[count]);
        const unsigned char first = count == 1 ? form.firstSecond : 0x80;
        const unsigned char last = count == 1 ? form.lastSecond : 0xBF;
        if (byte < first || byte > last) {
            break;
        }
    }
    return count;
}

}  // namespace

Utf8Sequence LeadingSequence(std::string_view text) {
    const auto lead = static_cast<unsigned char>(text.front());
    for (const SequenceForm& form : forms) {
        if (lead >= form.firstLead && lead <= form.lastLead) {
            const size_t fitting = FittingBytes(form, text);
            return {fitting, fitting == form.length};
        }
    }
    return {1, false};
}
