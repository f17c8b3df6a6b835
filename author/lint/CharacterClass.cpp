#include <author/lint/CharacterClass.h>

#include <cctype>
#include <charconv>

namespace Author {

namespace {

struct NamedClass {
    std::string_view name;
    int (*holds)(int);
};

constexpr NamedClass namedClasses[] = {
    {"alnum", isalnum}, {"alpha", isalpha}, {"blank", isblank}, {"cntrl", iscntrl},
    {"digit", isdigit}, {"graph", isgraph}, {"lower", islower}, {"print", isprint},
    {"punct", ispunct}, {"space", isspace}, {"upper", isupper}, {"xdigit", isxdigit},
    {"d", isdigit},     {"s", isspace},     {"l", islower},     {"u", isupper},
    {"h", isblank},
};

CharacterSet Named(std::string_view name) {
    CharacterSet characters;
    if (name == "w" || name == "word") {
        return Named("alnum") | Single('_');
    }
    if (name == "v") {
        return Range('\n', '\r');
    }
    for (const NamedClass& row : namedClasses) {
        for (int c = 0; row.name == name && c < 128; ++c) {
            characters[static_cast<size_t>(c)] = row.holds(c) != 0;
        }
    }
    if (characters.none()) {
        throw NotComputed();
    }
    return characters;
}

// Up to two hexadecimal digits, or any number of them in braces.
CharacterSet ReadHexadecimal(std::string_view text, size_t& at) {
    const bool isBraced = text.substr(at).starts_with('{');
    at += isBraced ? 1 : 0;
    const std::string_view digits = text.substr(at, isBraced ? std::string_view::npos : 2);
    unsigned number = 0;
    const auto [end, error] =
        std::from_chars(digits.data(), digits.data() + digits.size(), number, 16);
    at += static_cast<size_t>(end - digits.data());
    if (error != std::errc() || number > 255 || (isBraced && !text.substr(at).starts_with('}'))) {
        throw NotComputed();
    }
    at += isBraced ? 1 : 0;
    return Single(static_cast<char>(number));
}

// [:name:], or nothing when this does not stand here.
bool ReadNamed(std::string_view text, size_t& at, CharacterSet& characters) {
    if (text.substr(at).starts_with("[.") || text.substr(at).starts_with("[=")) {
        throw NotComputed();
    }
    if (!text.substr(at).starts_with("[:")) {
        return false;
    }
    std::string_view name = text.substr(at + 2, text.find(":]", at) - at - 2);
    at += name.size() + 4;
    const bool isNegated = name.starts_with('^');
    name.remove_prefix(isNegated ? 1 : 0);
    characters |= isNegated ? ~Named(name) : Named(name);
    return true;
}

// One end of a range, or a set on its own.
CharacterSet ReadMember(std::string_view text, size_t& at) {
    if (text[at] != '\\') {
        return Single(text[at++]);
    }
    ++at;
    if (text.substr(at).starts_with('b')) {
        ++at;
        return Single('\b');
    }
    return ReadEscape(text, at);
}

char OnlyMember(const CharacterSet& characters) {
    if (characters.count() != 1) {
        throw NotComputed();
    }
    return static_cast<char>(characters._Find_first());
}

}  // namespace

CharacterSet Single(char c) {
    CharacterSet characters;
    return characters.set(static_cast<unsigned char>(c));
}

CharacterSet Range(char first, char last) {
    CharacterSet characters;
    for (size_t c = static_cast<unsigned char>(first); c <= static_cast<unsigned char>(last); ++c) {
        characters.set(c);
    }
    return characters;
}

CharacterSet WithBothCases(CharacterSet characters) {
    for (size_t c = 'a'; c <= 'z'; ++c) {
        const size_t capital = c - 'a' + 'A';
        characters[c] = characters[capital] = characters[c] || characters[capital];
    }
    return characters;
}

CharacterSet ReadEscape(std::string_view text, size_t& at) {
    if (at >= text.size()) {
        throw NotComputed();
    }
    const char c = text[at++];
    constexpr std::string_view names = "tnrfae";
    constexpr std::string_view controls = "\t\n\r\f\a\x1b";
    if (const size_t control = names.find(c); control != std::string_view::npos) {
        return Single(controls[control]);
    }
    constexpr std::string_view classes = "dswluhv";
    const char lower = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    if (classes.find(lower) != std::string_view::npos) {
        const CharacterSet characters = Named(std::string_view(&lower, 1));
        return c == lower ? characters : ~characters;
    }
    if (c == 'x') {
        return ReadHexadecimal(text, at);
    }
    if (std::isalnum(static_cast<unsigned char>(c))) {
        throw NotComputed();
    }
    return Single(c);
}

CharacterSet ReadClass(std::string_view text, size_t& at) {
    CharacterSet characters;
    const bool isNegated = text.substr(at).starts_with('^');
    at += isNegated ? 1 : 0;
    const size_t begin = at;
    while (at < text.size() && (text[at] != ']' || at == begin)) {
        if (ReadNamed(text, at, characters)) {
            continue;
        }
        const CharacterSet first = ReadMember(text, at);
        if (at + 1 < text.size() && text[at] == '-' && text[at + 1] != ']') {
            ++at;
            characters |= Range(OnlyMember(first), OnlyMember(ReadMember(text, at)));
        } else {
            characters |= first;
        }
    }
    if (at >= text.size()) {
        throw NotComputed();
    }
    ++at;
    return isNegated ? ~characters : characters;
}

}  // namespace Author
