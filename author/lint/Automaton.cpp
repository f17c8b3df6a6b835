#include <author/lint/Automaton.h>

#include <algorithm>

namespace Author {

namespace {

constexpr size_t mostStates = 40;

void Append(std::vector<size_t>& states, const std::vector<size_t>& more) {
    states.insert(states.end(), more.begin(), more.end());
}

// The pairs of states that are reached from a pair, with the pair itself only when it is reached.
template <class Successors>
std::vector<bool> Reach(size_t size, size_t start, Successors successors) {
    std::vector<bool> reached(size * size);
    std::vector<size_t> open = {start};
    while (!open.empty()) {
        const size_t pair = open.back();
        open.pop_back();
        successors(pair / size, pair % size, [&](size_t one, size_t other) {
            if (!reached[one * size + other]) {
                reached[one * size + other] = true;
                open.push_back(one * size + other);
            }
        });
    }
    return reached;
}

}  // namespace

Piece Automaton::AddState(const CharacterSet& characters) {
    _characters.push_back(characters);
    _following.emplace_back();
    return {false, {GetSize() - 1}, {GetSize() - 1}};
}

Piece Automaton::Concatenate(Piece one, const Piece& other) {
    for (const size_t state : one.last) {
        _following[state].insert(other.first.begin(), other.first.end());
    }
    if (one.isNullable) {
        Append(one.first, other.first);
    }
    if (!other.isNullable) {
        one.last.clear();
    }
    Append(one.last, other.last);
    one.isNullable = one.isNullable && other.isNullable;
    return one;
}

Piece Automaton::Alternate(Piece one, const Piece& other) {
    Append(one.first, other.first);
    Append(one.last, other.last);
    one.isNullable = one.isNullable || other.isNullable;
    return one;
}

Piece Automaton::Loop(const Piece& piece) {
    for (const size_t state : piece.last) {
        for (const size_t next : piece.first) {
            _loopsTwice = !_following[state].insert(next).second || _loopsTwice;
        }
    }
    return piece;
}

bool Automaton::ReturnsByTwoWays(size_t state) const {
    const size_t size = GetSize();
    const auto forward =
        Reach(size, state * size + state, [this](size_t one, size_t other, auto add) {
            for (const size_t next : _following[one]) {
                for (const size_t otherNext : _following[other]) {
                    if ((_characters[next] & _characters[otherNext]).any()) {
                        add(next, otherNext);
                    }
                }
            }
        });
    const auto isApart = [size, pair = size_t{0}](bool isReached) mutable {
        const bool differs = pair / size != pair % size;
        ++pair;
        return isReached && differs;
    };
    if (!forward[state * size + state] || std::ranges::none_of(forward, isApart)) {
        return false;
    }
    const auto backward =
        Reach(size, state * size + state, [&](size_t one, size_t other, auto add) {
            if ((_characters[one] & _characters[other]).none()) {
                return;
            }
            for (size_t before = 0; before < size; ++before) {
                for (size_t otherBefore = 0; otherBefore < size; ++otherBefore) {
                    if (forward[before * size + otherBefore] && _following[before].contains(one) &&
                        _following[otherBefore].contains(other)) {
                        add(before, otherBefore);
                    }
                }
            }
        });
    return std::ranges::any_of(backward, isApart);
}

bool Automaton::IsAmbiguousInLoops() const {
    if (_loopsTwice || GetSize() > mostStates) {
        return _loopsTwice;
    }
    for (size_t state = 0; state < GetSize(); ++state) {
        if (ReturnsByTwoWays(state)) {
            return true;
        }
    }
    return false;
}

}  // namespace Author
