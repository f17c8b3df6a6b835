#include <author/lint/ShellLine.h>

#include <algorithm>
#include <array>

namespace Author {

namespace {

constexpr size_t npos = std::string_view::npos;

template <size_t Count>
bool Contains(const std::array<std::string_view, Count>& words, std::string_view word) {
    return std::ranges::find(words, word) != words.end();
}

bool LeadsToCommand(std::string_view word) {
    constexpr auto words = std::to_array<std::string_view>(
        {"if", "then", "elif", "else", "do", "while", "until", "!", "{"});
    return Contains(words, word);
}

bool IsOtherKeyword(std::string_view word) {
    constexpr auto words =
        std::to_array<std::string_view>({"for", "case", "in", "fi", "done", "esac", "}"});
    return Contains(words, word);
}

bool IsAssignment(std::string_view word) {
    const size_t equals = word.find('=');
    return equals != npos && equals > 0 &&
           word.find_first_not_of(
               "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789_") == equals;
}

class Reader {
public:
    explicit Reader(std::string_view text) : _text(text) {
        _line.quoting.resize(text.size(), Quoting::Bare);
        _line.beginsWord.resize(text.size(), false);
    }

    ShellLine Read() {
        while (_at < _text.size()) {
            IsQuoted() ? ReadQuoted() : ReadBare();
        }
        EndWord();
        _line.isClosed = _line.isClosed && _levels.size() == 1;
        return std::move(_line);
    }

private:
    enum class Kind { Line, Parentheses, Backquotes, Braces, DoubleQuotes, QuotedBraces };

    // What is open at a place: the whole line, or something in it.
    struct Level {
        Kind kind;
        bool expectsCommand = true;
        bool isRedirected = false;  // the next word is a file
        bool isInWord = false;
        ShellWord word{};
    };

    Level& Top() { return _levels.back(); }

    bool IsQuoted() { return Top().kind == Kind::DoubleQuotes || Top().kind == Kind::QuotedBraces; }

    void Open(Kind kind) { _levels.push_back({.kind = kind}); }

    void Close() {
        if (_levels.size() > 1) {
            _levels.pop_back();
        }
    }

    // Notes what the characters are up to `end`, and goes there.
    void Pass(size_t end, Quoting quoting) {
        end = std::min(end, _text.size());
        for (; _at < end; ++_at) {
            _line.quoting[_at] = quoting;
        }
    }

    void AddToWord(std::string_view text, bool isPlain) {
        Level& level =
            *std::ranges::find_if(_levels.rbegin(), _levels.rend(), [](const Level& one) {
                return one.kind == Kind::Line || one.kind == Kind::Parentheses ||
                       one.kind == Kind::Backquotes;
            });
        if (!level.isInWord) {
            level.isInWord = true;
            level.word = {};
            _line.beginsWord[_at] = true;
        }
        level.word.text += text;
        level.word.isPlain = level.word.isPlain && isPlain;
    }

    void EndWord() {
        Level& level = Top();
        if (!level.isInWord) {
            return;
        }
        level.isInWord = false;
        if (level.isRedirected) {
            level.isRedirected = false;
        } else if (level.expectsCommand && !LeadsToCommand(level.word.text) &&
                   !IsAssignment(level.word.text)) {
            level.expectsCommand = false;
            _line.closesGroup = _line.closesGroup || level.word.text == "}";
            if (!IsOtherKeyword(level.word.text)) {
                _line.commands.push_back(level.word);
            }
        }
    }

    // `$(`, `${` or a backquote: true when something of the kind opens here.
    bool ReadExpansion(Quoting quoting, Kind braces) {
        const std::string_view rest = _text.substr(_at);
        if (rest.starts_with('`')) {
            AddToWord("", false);
            const auto open = std::ranges::find(_levels, Kind::Backquotes, &Level::kind);
            Pass(_at + 1, quoting);
            if (open == _levels.end()) {
                Open(Kind::Backquotes);
            } else {
                EndWord();
                _levels.erase(open, _levels.end());
            }
            return true;
        }
        if (!rest.starts_with("$(") && !rest.starts_with("${")) {
            return false;
        }
        AddToWord("", false);
        Pass(_at + 2, quoting);
        Open(rest[1] == '(' ? Kind::Parentheses : braces);
        return true;
    }

    void ReadQuoted() {
        const char c = _text[_at];
        if (ReadExpansion(Quoting::Double, Kind::QuotedBraces)) {
            return;
        }
        if (c == (Top().kind == Kind::DoubleQuotes ? '"' : '}')) {
            Pass(_at + 1, Quoting::Double);
            Close();
        } else {
            AddToWord(_text.substr(_at, 1), c != '$');
            Pass(_at + (c == '\\' ? 2 : 1), Quoting::Double);
        }
    }

    void ReadBare() {
        const char c = _text[_at];
        if (c == '\\') {
            AddToWord(_text.substr(_at + 1, 1), true);
            Pass(_at + 2, Quoting::Bare);
        } else if (c == '\'') {
            ReadSingleQuotes();
        } else if (c == '"') {
            AddToWord("", true);
            Pass(_at + 1, Quoting::Double);
            Open(Kind::DoubleQuotes);
        } else if (ReadExpansion(Quoting::Bare, Kind::Braces)) {
            return;
        } else if (Top().kind == Kind::Braces) {
            if (c == '}') {
                Close();
            }
            Pass(_at + 1, Quoting::Bare);
        } else if (c == '#' && !Top().isInWord) {
            Pass(_text.find('\n', _at), Quoting::Comment);
        } else {
            ReadPlain(c);
        }
    }

    void ReadSingleQuotes() {
        const size_t end = _text.find('\'', _at + 1);
        AddToWord(_text.substr(_at + 1, end == npos ? end : end - _at - 1), true);
        _line.isClosed = _line.isClosed && end != npos;
        const bool isInBackquotes =
            std::ranges::find(_levels, Kind::Backquotes, &Level::kind) != _levels.end();
        Pass(end == npos ? end : end + 1,
             isInBackquotes ? Quoting::SingleInBackquotes : Quoting::Single);
    }

    void ReadPlain(char c) {
        constexpr std::string_view separators = ";&|\n";
        if (c == '(') {
            EndWord();
            Open(Kind::Parentheses);
        } else if (c == ')') {
            EndWord();
            if (Top().kind == Kind::Parentheses) {
                Close();
            }
        } else if (separators.find(c) != npos) {
            EndWord();
            Top().expectsCommand = true;
        } else if (c == '<' || c == '>') {
            ReadRedirection();
        } else if (c == ' ' || c == '\t') {
            EndWord();
        } else {
            constexpr std::string_view expanded = "$*?[~";
            AddToWord(_text.substr(_at, 1), expanded.find(c) == npos);
        }
        Pass(_at + 1, Quoting::Bare);
    }

    // The digits in front of it are no word, and an `&` behind it separates nothing.
    void ReadRedirection() {
        Level& level = Top();
        if (level.isInWord && level.word.text.find_first_not_of("0123456789") == npos) {
            level.isInWord = false;
        }
        EndWord();
        level.isRedirected = true;
        if (_text.substr(_at).starts_with("<<")) {
            _line.hasHereDocument = true;
        }
        while (_at + 1 < _text.size() && std::string_view("<>&|").find(_text[_at + 1]) != npos) {
            Pass(_at + 1, Quoting::Bare);
        }
    }

    std::string_view _text;
    size_t _at = 0;
    std::vector<Level> _levels = {{.kind = Kind::Line}};
    ShellLine _line;
};

}  // namespace

ShellLine ReadShellLine(std::string_view text) {
    return Reader(text).Read();
}

}  // namespace Author
