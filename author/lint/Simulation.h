#pragma once

#include <author/lint/Declared.h>
#include <author/lint/Template.h>

#include <vector>

namespace Author {

/// What the engine has done to a value on its way into a template.
enum class Treatment : char { Escaped, WithoutSingleQuotes, WithoutDoubleQuotes, Unchanged };

/// A value where it stands in an expanded template.
struct Occurrence {
    const DeclaredParameter* parameter;
    size_t place;  ///< in the text, where a mark stands for the value
    Treatment treatment;
};

/// A template as the engine expands it for some parameters, with marks for the values.
struct Expansion {
    std::vector<std::string> options;  ///< the optional parameters that were given
    std::string text;
    std::string expected;           ///< as the author means it
    std::vector<std::string> left;  ///< parameters whose forms arrive as they are
    std::vector<Occurrence> occurrences;
};

/// The expansions without optional parameters, with each alone, each pair of them (of the first
/// twenty), and all. Empty when the engine refuses to expand.
std::vector<Expansion> Simulate(const DeclaredCommand& command, const Template& read, bool isStdin);

/// The text with <name> in place of the marks.
std::string Readable(const std::string& text, const DeclaredCommand& command);

}  // namespace Author
