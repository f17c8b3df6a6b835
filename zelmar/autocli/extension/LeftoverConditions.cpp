// One pass from left to right, whose position always stands at a `{`. What is in front of it has
// been moved to `_done`; what follows it is still the end of `_text`, since erasing takes away text
// on both sides of the position and never changes what comes after. So braces are paired once for
// the whole text, and openings of conditions are looked up once, however often text is erased.

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

// For each `{` the place of the `}` that pairs with it.
std::vector<size_t> PairBraces(std::string_view text) {
    std::vector<size_t> closes(text.size(), npos);
    std::vector<size_t> open;
    for (size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '{') {
            open.push_back(i);
        } else if (text[i] == '}' && !open.empty()) {
            closes[open.back()] = i;
            open.pop_back();
        }
    }
    return closes;
}

class Remover {
public:
    explicit Remover(std::string_view text)
        : _text(text), _closes(PairBraces(text)), _opening(FindOpening(text, 0)) {}

    std::string Run() {
        KeepUpToBrace();
        while (_next < _text.size()) {
            const size_t close = _closes[_next];
            if (close == npos) {
                Keep(1);
            } else if (HoldsCondition(close)) {
                EraseThrough(close);
            } else {
                Keep(close + 1 - _next);
            }
            KeepUpToBrace();
        }
        return std::move(_done);
    }

private:
    struct Dollar {
        size_t place;
        bool isPlain = false;  // opens no condition in front of the position
    };

    void Keep(size_t count) {
        const std::string_view kept = _text.substr(_next, count);
        for (size_t i = kept.find('$'); i != npos; i = kept.find('$', i + 1)) {
            _dollars.push_back({_done.size() + i});
        }
        _done.append(kept);
        _next += kept.size();
    }

    void KeepUpToBrace() { Keep(std::min(_text.find('{', _next), _text.size()) - _next); }

    // The text after the erased one moves down, and the position does not move with it.
    void EraseThrough(size_t close) {
        const size_t passed = _done.size() - _dollars.back().place;
        _done.resize(_dollars.back().place);
        _dollars.pop_back();
        _next = close + 1;
        Keep(passed);
    }

    // Is there a condition in the text from the nearest `$` to the end of the pair?
    bool HoldsCondition(size_t close) {
        return !_dollars.empty() && (OpensBefore() || OpensAtPosition(close) || OpensInside(close));
    }

    // `$if{<name>,` is over before the position. It then closes with the pair.
    bool OpensBefore() {
        Dollar& dollar = _dollars.back();
        const std::string_view lead = std::string_view(_done).substr(dollar.place);
        if (dollar.isPlain || lead == "$if") {
            return false;
        }
        dollar.isPlain = FindOpening(lead, 0).place == npos;
        return !dollar.isPlain;
    }

    // The brace of `$if{<name>,` is the one at the position.
    [[nodiscard]] bool OpensAtPosition(size_t close) const {
        if (!_done.ends_with("$if")) {
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

    std::string_view _text;
    std::vector<size_t> _closes;
    Opening _opening;  // the first one at or behind the position, once it was asked for
    size_t _next = 0;
    std::string _done;
    std::vector<Dollar> _dollars;  // of `_done`
};

}  // namespace

void RemoveLeftoverConditions(std::string& text) {
    const Opening first = FindOpening(text, 0);
    const size_t lastClose = text.rfind('}');
    if (first.place != npos && lastClose != npos && first.body < lastClose) {
        text = Remover(text).Run();
    }
}

}  // namespace AutoCli
