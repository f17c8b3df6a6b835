#include <zelmar/autocli/formatters/Columns.h>
#include <zelmar/internal/Utf8.h>

#include <langinfo.h>
#include <locale.h>
#include <wchar.h>

#include <algorithm>

namespace {

// `wcwidth` knows what the locale of the thread knows, so that one of UTF-8 takes its place for as
// long as this lives.
class WidthLocale {
public:
    WidthLocale() : _former(uselocale(Utf8())) {}
    WidthLocale(const WidthLocale&) = delete;
    WidthLocale& operator=(const WidthLocale&) = delete;
    ~WidthLocale() { uselocale(_former); }

private:
    // Null where the machine has none: then nothing is changed, and each character takes a column.
    // Made once and kept, for the last text may be written while the process ends.
    static locale_t Utf8() {
        static const locale_t locale = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
        return locale;
    }

    const locale_t _former;
};

wchar_t Decode(std::string_view character) {
    auto code = static_cast<unsigned char>(character[0]) & (0x7Fu >> character.size());
    for (const char byte : character.substr(1)) {
        code = code << 6 | (static_cast<unsigned char>(byte) & 0x3Fu);
    }
    return static_cast<wchar_t>(code);
}

size_t ColumnsOfCharacter(std::string_view character) {
    const int columns = character.size() > 1 ? wcwidth(Decode(character)) : 1;
    return columns < 0 ? 1 : static_cast<size_t>(columns);
}

}  // namespace

bool LocaleIsUtf8() {
    const locale_t locale = newlocale(LC_CTYPE_MASK, "", nullptr);
    if (!locale) {
        return false;
    }
    const bool isUtf8 = std::string_view(nl_langinfo_l(CODESET, locale)) == "UTF-8";
    freelocale(locale);
    return isUtf8;
}

size_t ColumnsOf(std::string_view text) {
    if (std::ranges::all_of(text, [](char c) { return (c & 0x80) == 0; })) {
        return text.size();
    }
    const WidthLocale locale;
    size_t columns = 0;
    while (!text.empty()) {
        const Utf8Sequence sequence = LeadingSequence(text);
        columns += sequence.isWellFormed ? ColumnsOfCharacter(text.substr(0, sequence.length)) : 1;
        text.remove_prefix(sequence.length);
    }
    return columns;
}
