// A reader by recursive descent. It computes the characters of each place from what stands there
// alone, so that the union of them is never too small.

#include <author/lint/Automaton.h>
#include <author/lint/CharacterClass.h>
#include <author/lint/Expression.h>

#include <algorithm>
#include <charconv>

namespace Author {

namespace {

constexpr size_t mostStates = 2000;
constexpr int deepestGroup = 200;

class Reader {
public:
    explicit Reader(std::string_view text) : _text(text) {}

    Expression Read() {
        ReadAlternatives();
        if (_at < _text.size()) {
            throw NotComputed();
        }
        _result.blowsUp = !_isAtomic && !_result.hasLookaround && _automaton.IsAmbiguousInLoops();
        return _result;
    }

private:
    [[nodiscard]] bool Sees(std::string_view words) const {
        return _text.substr(_at).starts_with(words);
    }

    bool Take(std::string_view words) {
        const bool isThere = Sees(words);
        _at += isThere ? words.size() : 0;
        return isThere;
    }

    Piece ReadAlternatives() {
        Piece piece = ReadSequence();
        while (Take("|")) {
            piece = Automaton::Alternate(std::move(piece), ReadSequence());
        }
        return piece;
    }

    Piece ReadSequence() {
        Piece piece;
        while (_at < _text.size() && !Sees("|") && !Sees(")")) {
            piece = _automaton.Concatenate(std::move(piece), ReadRepeated());
        }
        return piece;
    }

    // At most two copies of a piece show all that matters of a repetition with a bound.
    Piece ReadRepeated() {
        const size_t begin = _at;
        Piece piece = ReadAtom();
        Repetition repetition;
        while (TakeRepetition(repetition)) {
            _isAtomic = Take("+") || _isAtomic;
            Take("?");
            if (!repetition.hasMost) {
                piece = _automaton.Loop(piece);
            } else if (repetition.most > 1) {
                const size_t end = _at;
                _at = begin;
                Piece copy = ReadAtom();
                _at = end;
                copy.isNullable = copy.isNullable || repetition.least < repetition.most;
                piece = _automaton.Concatenate(std::move(piece), copy);
            }
            piece.isNullable = piece.isNullable || repetition.least == 0;
        }
        return piece;
    }

    struct Repetition {
        size_t least = 0;
        size_t most = 0;
        bool hasMost = false;
    };

    bool TakeRepetition(Repetition& repetition) {
        if (Take("*")) {
            repetition = {0, 0, false};
        } else if (Take("+")) {
            repetition = {1, 0, false};
        } else if (Take("?")) {
            repetition = {0, 1, true};
        } else {
            return TakeBounds(repetition);
        }
        return true;
    }

    // {2} {2,} {2,3}; any other brace is a character like others.
    bool TakeBounds(Repetition& repetition) {
        size_t at = _at + 1;
        if (!Sees("{") || !TakeNumber(at, repetition.least)) {
            return false;
        }
        repetition.most = repetition.least;
        repetition.hasMost = true;
        if (_text.substr(at).starts_with(',')) {
            ++at;
            repetition.hasMost = TakeNumber(at, repetition.most);
        }
        if (!_text.substr(at).starts_with('}')) {
            return false;
        }
        _at = at + 1;
        return true;
    }

    bool TakeNumber(size_t& at, size_t& number) {
        const char* begin = _text.data() + std::min(at, _text.size());
        const auto [end, error] = std::from_chars(begin, _text.data() + _text.size(), number);
        at += static_cast<size_t>(end - begin);
        return error == std::errc();
    }

    Piece ReadAtom() {
        const char c = _text[_at++];
        switch (c) {
            case '(':
                return ReadGroup();
            case '[':
                return AddState(ReadClass(_text, _at));
            case '.':
                return AddState(CharacterSet().set());
            case '\\':
                return ReadEscaped();
            case '^':
            case '$':
                return {};
            default:
                return AddState(Single(c));
        }
    }

    Piece AddState(const CharacterSet& characters) {
        if (_automaton.GetSize() >= mostStates) {
            throw NotComputed();
        }
        const CharacterSet all = _ignoresCase ? WithBothCases(characters) : characters;
        _result.characters |= all;
        return _automaton.AddState(all);
    }

    // Places without a character, and references to what a group has taken, add nothing.
    Piece ReadEscaped() {
        constexpr std::string_view marks = "bBAzZG<>`'123456789";
        if (_at < _text.size() && marks.find(_text[_at]) != std::string_view::npos) {
            _isAtomic = _isAtomic || (_text[_at] >= '1' && _text[_at] <= '9');
            ++_at;
            return {};
        }
        return AddState(ReadEscape(_text, _at));
    }

    Piece ReadGroup() {
        if (++_depth > deepestGroup) {
            throw NotComputed();
        }
        const bool outerCase = _ignoresCase;
        Piece piece = ReadGroupBody();
        _ignoresCase = outerCase;
        --_depth;
        return piece;
    }

    Piece ReadGroupBody() {
        if (Take("?#")) {
            _at = std::min(_text.find(')', _at), _text.size());
        }
        if (Take("?=") || Take("?!") || Take("?<=") || Take("?<!")) {
            return SkipLookaround();
        }
        if (Take("?>")) {
            _isAtomic = true;
        } else if (Take("?i:") || Take("?i)")) {
            _ignoresCase = true;
        } else if (Sees("?") && !Take("?:")) {
            throw NotComputed();
        }
        if (_text[_at - 1] == ')') {
            return ReadAlternatives();  // (?i) holds up to the end of the group around it
        }
        return CloseGroup(ReadAlternatives());
    }

    // What is looked at is not taken: its characters do not count.
    Piece SkipLookaround() {
        const CharacterSet outside = _result.characters;
        CloseGroup(ReadAlternatives());
        _result.characters = outside;
        _result.hasLookaround = true;
        return {};
    }

    Piece CloseGroup(Piece piece) {
        if (!Take(")")) {
            throw NotComputed();
        }
        return piece;
    }

    std::string_view _text;
    size_t _at = 0;
    int _depth = 0;
    bool _ignoresCase = false;
    bool _isAtomic = false;  // there is what limits the ways of matching
    Automaton _automaton;
    Expression _result;
};

}  // namespace

Expression ReadExpression(std::string_view text) {
    try {
        return Reader(text).Read();
    } catch (const NotComputed&) {
        Expression everything;
        everything.characters.set();
        everything.hasLookaround = true;
        return everything;
    }
}

}  // namespace Author
