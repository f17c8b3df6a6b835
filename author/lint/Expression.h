#pragma once

#include <bitset>
#include <string_view>

namespace Author {

/// A set of bytes.
using CharacterSet = std::bitset<256>;

/// What can be said of a regular expression in Perl's syntax, as Boost reads it, without running
/// it. Anything that this reader does not know counts as everything.
struct Expression {
    CharacterSet characters;     ///< that a text which matches as a whole can hold, and maybe more
    bool hasLookaround = false;  ///< which may keep out sequences of these characters
    bool blowsUp = false;        ///< the time of a failing match doubles with each character
};

/// Takes any text. An expression that does not compile gives something.
Expression ReadExpression(std::string_view text);

}  // namespace Author
