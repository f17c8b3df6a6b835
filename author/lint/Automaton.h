#pragma once

#include <author/lint/Expression.h>

#include <set>
#include <vector>

namespace Author {

// Glushkov's automaton of an expression: a state for each place where it names a character or a
// class (Glushkov, "The abstract theory of automata", 1961).

/// A part of an expression: the states it can begin and end with.
struct Piece {
    bool isNullable = true;
    std::vector<size_t> first;
    std::vector<size_t> last;
};

class Automaton {
public:
    Piece AddState(const CharacterSet& characters);
    Piece Concatenate(Piece one, const Piece& other);
    static Piece Alternate(Piece one, const Piece& other);
    /// Lets the piece follow itself.
    Piece Loop(const Piece& piece);

    [[nodiscard]] size_t GetSize() const { return _characters.size(); }
    /// Are there two ways along the same text from a state back to itself? Then a matcher that
    /// tries one after the other doubles its work each time round (Weideman et al., "Analyzing
    /// matching time behavior of backtracking regular expression matchers", 2016). Not looked into
    /// beyond 40 states.
    [[nodiscard]] bool IsAmbiguousInLoops() const;

private:
    [[nodiscard]] bool ReturnsByTwoWays(size_t state) const;

    std::vector<CharacterSet> _characters;
    std::vector<std::set<size_t>> _following;
    bool _loopsTwice = false;
};

}  // namespace Author
