#include <zelmar/autocli/completion/BashLine.h>
#include <zelmar/internal/Ascii.h>
#include <zelmar/internal/ControlCharacters.h>

#include <cstdio>

namespace AutoCli {

namespace {

using Quote = BashLine::Quote;

bool Holds(std::string_view set, char c) {
    return set.find(c) != std::string_view::npos;
}

bool IsOctal(char c) {
    return c >= '0' && c <= '7';
}

class Reader {
public:
    Reader(std::string_view line, std::string_view wordBreaks)
        : _line(line), _wordBreaks(wordBreaks) {}

    BashLine Read() {
        while (_at < _line.size()) {
            ReadOne();
        }
        _result.words.push_back(std::move(_word));
        _result.replaced = _line.substr(_start);
        _result.quote = _quote;
        return std::move(_result);
    }

private:
    void ReadOne() {
        switch (_quote) {
            case Quote::None:
                ReadBare();
                break;
            case Quote::Single:
                TakeUnless('\'');
                break;
            case Quote::Double:
                if (_line[_at] == '\\') {
                    ReadEscapeInDouble();
                } else {
                    TakeUnless('"');
                }
                break;
            case Quote::Ansi:
                if (_line[_at] == '\\') {
                    ReadAnsiEscape();
                } else {
                    TakeUnless('\'');
                }
                break;
        }
    }

    void ReadBare() {
        const std::string_view rest = _line.substr(_at);
        if (Holds(" \t\n", rest[0])) {
            EndWord();
        } else if (rest[0] == '\\') {
            _inWord = true;
            ++_at;
            if (_at < _line.size() && _line[_at++] != '\n') {
                _word += _line[_at - 1];
            }
        } else if (rest.starts_with("$'")) {
            Open(Quote::Ansi, 2);
        } else if (rest[0] == '\'' || rest[0] == '"') {
            Open(rest[0] == '"' ? Quote::Double : Quote::Single, 1);
        } else {
            _inWord = true;
            _word += _line[_at++];
            if (Holds(_wordBreaks, rest[0])) {
                _start = _at;
                _result.kept = _word.size();
            }
        }
    }

    void EndWord() {
        if (_inWord) {
            _result.words.push_back(std::move(_word));
            _word.clear();
            _inWord = false;
        }
        _start = ++_at;
        _result.kept = 0;
    }

    void Open(Quote quote, size_t length) {
        _outer = {_start, _result.kept};
        _inWord = true;
        _quote = quote;
        _start = _at += length;
        _result.kept = _word.size();
    }

    // A quote that is closed is no place where the replaced part begins.
    void TakeUnless(char closing) {
        if (_line[_at] != closing) {
            _word += _line[_at++];
            return;
        }
        ++_at;
        _quote = Quote::None;
        _start = _outer.start;
        _result.kept = _outer.kept;
    }

    void ReadEscapeInDouble() {
        ++_at;
        if (_at == _line.size() || !Holds("$`\"\\\n", _line[_at])) {
            _word += '\\';
        } else if (_line[_at++] != '\n') {
            _word += _line[_at - 1];
        }
    }

    void ReadAnsiEscape() {
        constexpr std::string_view letters = "abeEfnrtv";
        constexpr std::string_view meanings = "\a\b\x1b\x1b\f\n\r\t\v";
        if (++_at == _line.size()) {
            return;
        }
        if (IsOctal(_line[_at])) {
            unsigned code = 0;
            for (int digits = 0; digits < 3 && _at < _line.size() && IsOctal(_line[_at]);
                 ++digits) {
                code = code * 8 + static_cast<unsigned>(_line[_at++] - '0');
            }
            _word += static_cast<char>(code);
            return;
        }
        const size_t letter = letters.find(_line[_at]);
        _word += letter == std::string_view::npos ? _line[_at] : meanings[letter];
        ++_at;
    }

    struct Place {
        size_t start = 0;
        size_t kept = 0;
    };

    const std::string_view _line;
    const std::string_view _wordBreaks;
    BashLine _result;
    std::string _word;
    bool _inWord = false;
    Quote _quote = Quote::None;
    size_t _at = 0;
    size_t _start = 0;  // of the part that is replaced
    Place _outer;       // what it was ahead of the open quote
};

std::string AnsiEscapes(std::string_view bytes) {
    std::string text;
    for (const char byte : bytes) {
        char escape[8];
        std::snprintf(escape, sizeof escape, "\\%03o", static_cast<unsigned char>(byte));
        text += escape;
    }
    return text;
}

bool IsHarmless(char c) {
    return Ascii::IsAlnum(c) || Holds("_-./:=,+@%", c) || static_cast<unsigned char>(c) >= 0x80;
}

// One character that is no control character.
std::string QuoteOne(char c, Quote quote) {
    switch (quote) {
        case Quote::Single:
            return c == '\'' ? R"('\'')" : std::string(1, c);
        case Quote::Double:
            // A backslash ahead of "!" would stay.
            return c == '!' ? R"("'!'")" : (Holds("$`\"\\", c) ? "\\" : "") + std::string(1, c);
        case Quote::Ansi:
            return (Holds("'\\", c) ? "\\" : "") + std::string(1, c);
        case Quote::None:
            break;
    }
    return (IsHarmless(c) ? "" : "\\") + std::string(1, c);
}

// What closes the quote.
std::string QuoteMark(Quote quote) {
    return quote == Quote::None ? "" : quote == Quote::Double ? "\"" : "'";
}

}  // namespace

BashLine ReadBashLine(std::string_view line, std::string_view wordBreaks) {
    return Reader(line, wordBreaks).Read();
}

// Other quotes are left for a control character and opened again behind it. The line editor closes
// an open quote itself, unless the last character is such a quote already.
std::string QuoteForBash(std::string_view text, Quote quote) {
    const std::string mark = QuoteMark(quote);
    std::string quoted;
    while (!text.empty()) {
        const size_t length = FindControlCharacter(text).length;
        if (length == 0) {
            quoted += QuoteOne(text[0], quote);
            text.remove_prefix(1);
            continue;
        }
        const std::string escapes = AnsiEscapes(text.substr(0, length));
        quoted += quote == Quote::Ansi ? escapes : mark + "$'" + escapes + "'" + mark;
        text.remove_prefix(length);
    }
    return quoted.ends_with(mark) ? quoted + mark : quoted;
}

}  // namespace AutoCli
