// One pass from left to right, in place. The position always stands at a `{`; what is in front of
// it and stays has been moved to the front of the text, and what follows it has not been touched,
// since erasing takes away text on both sides of the position and never changes what comes after.
// So whether a brace is closed is found out once for the whole text.

#include <zelmar/autocli/extension/ExtensionCommand.h>
#include <zelmar/autocli/extension/LeftoverConditions.h>
#include <zelmar/internal/Ascii.h>

#include <algorithm>
#include <string_view>
#include <vector>

namespace AutoCli {

namespace {

constexpr size_t npos = std::string_view::npos;

bool IsNameCharacter(char c) {
    return Ascii::IsLower(c) || Ascii::IsDigit(c) || c == '-';
}

// Where the body starts of a condition whose name begins at `name`: behind the comma. Else npos.
size_t BodyAfterName(std::string_view text, size_t name) {
    size_t end = name;
    while (end < text.size() && IsNameCharacter(text[end])) {
        ++end;
    }
    return end > name && end < text.size() && text[end] == ',' ? end + 1 : npos;
}

// The opening of a condition in a text: `$if{<name>,`. It is one when a `}` follows behind the
// first character of the body.
struct Opening {
    size_t place = npos;
    size_t body = npos;
};

Opening FindOpening(std::string_view text, size_t from) {
    constexpr std::string_view head = "$if{";
    for (size_t place = text.find(head, from); place != npos; place = text.find(head, place + 1)) {
        const size_t body = BodyAfterName(text, place + head.size());
        if (body != npos) {
            return {place, body};
        }
    }
    return {};
}

// Which braces are open to the end: a bit for each character.
std::vector<bool> FindUnclosed(std::string_view text) {
    std::vector<bool> unclosed(text.size());
    size_t closes = 0;
    for (size_t i = text.size(); i-- > 0;) {
        if (text[i] == '}') {
            ++closes;
        } else if (text[i] == '{') {
            unclosed[i] = closes == 0;
            closes -= closes == 0 ? 0 : 1;
        }
    }
    return unclosed;
}

class Remover {
public:
    explicit Remover(std::string& text)
        : _text(text), _unclosed(FindUnclosed(text)), _opening(FindOpening(text, 0)) {}

    void Run() {
        KeepUpToBrace();
        while (_next < _text.size()) {
            if (_unclosed[_next]) {
                Keep(1);
            } else {
                VisitPair();
            }
            KeepUpToBrace();
        }
        _text.resize(_done);
    }

private:
    // A `$` in what is kept, which was the nearest to the position when a pair was visited.
    struct Dollar {
        size_t place;
        size_t searchedFrom;
        bool isPlain = false;  // opens no condition in front of the position
    };

    void Keep(size_t count) {
        if (_done != _next) {
            std::copy_n(_text.begin() + static_cast<long>(_next), count,
                        _text.begin() + static_cast<long>(_done));
        }
        _done += count;
        _next += count;
    }

    void KeepUpToBrace() { Keep(std::min(_text.find('{', _next), _text.size()) - _next); }

    void VisitPair() {
        const size_t size = FindPairedTokenSize(_text.data(), _next, _text.size(), '{', '}').second;
        if (FindDollar() && HoldsCondition(_next + size - 1)) {
            EraseThrough(_next + size);
        } else {
            Keep(size);
        }
    }

    [[nodiscard]] std::string_view Kept() const { return std::string_view(_text).substr(0, _done); }

    // Looks for the nearest `$` in what was kept since the last look.
    bool FindDollar() {
        const size_t place = Kept().substr(_searched).rfind('$');
        if (place != npos) {
            _dollars.push_back({_searched + place, _searched});
        }
        _searched = _done;
        return !_dollars.empty();
    }

    // The text after the erased one moves down, and the position does not move with it.
    void EraseThrough(size_t end) {
        const Dollar dollar = _dollars.back();
        _dollars.pop_back();
        const size_t passed = _done - dollar.place;
        _done = dollar.place;
        _searched = dollar.searchedFrom;
        _next = end;
        Keep(std::min(passed, _text.size() - end));
    }

    // Is there a condition in the text from the nearest `$` to the end of the pair?
    bool HoldsCondition(size_t close) {
        return OpensBefore() || OpensAtPosition(close) || OpensInside(close);
    }

    // `$if{<name>,` is over before the position. It then closes with the pair.
    bool OpensBefore() {
        Dollar& dollar = _dollars.back();
        const std::string_view lead = Kept().substr(dollar.place);
        if (dollar.isPlain || lead == "$if") {
            return false;
        }
        dollar.isPlain = FindOpening(lead, 0).place == npos;
        return !dollar.isPlain;
    }

    // The brace of `$if{<name>,` is the one at the position.
    [[nodiscard]] bool OpensAtPosition(size_t close) const {
        if (!Kept().ends_with("$if")) {
            return false;
        }
        const size_t body = BodyAfterName(_text, _next + 1);
        return body != npos && body < close;
    }

    // The brace of one inside pairs inside, and so behind its body.
    bool OpensInside(size_t close) {
        if (_opening.place < _next) {
            _opening = FindOpening(_text, _next);
        }
        return _opening.place < close;
    }

    std::string& _text;
    std::vector<bool> _unclosed;
    Opening _opening;  // the first one at or behind the position, once it was asked for
    size_t _next = 0;
    size_t _done = 0;      // the end of what is kept
    size_t _searched = 0;  // up to here, each pair's nearest `$` is known
    std::vector<Dollar> _dollars;
};

}  // namespace

void RemoveLeftoverConditions(std::string& text) {
    const Opening first = FindOpening(text, 0);
    const size_t lastClose = text.rfind('}');
    if (first.place != npos && lastClose != npos && first.body < lastClose) {
        Remover(text).Run();
    }
}

}  // namespace AutoCli
