// What lint reads of foreign texts: a regular expression in the first line and a value behind it. A
// value that the engine lets through holds no character that lint takes for impossible.

#include <author/lint/Expression.h>
#include <author/lint/ShellLine.h>
#include <author/lint/Template.h>
#include <zelmar/callspec/Output.h>
#include <zelmar/callspec/ParameterConstraint.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <string>

using CallSpec::ParameterConstraint;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(reinterpret_cast<const char*>(data), size);
    const auto line = Author::ReadShellLine(text);
    std::vector<std::string> left;
    Author::Expand(Author::ReadTemplate(text).nodes, {{"a", {"1"}}}, false, left);
    const std::string regex = text.substr(0, text.find('\n'));
    const std::string value = text.substr(std::min(regex.size() + 1, text.size()));
    const Author::Expression expression = Author::ReadExpression(regex);
    constexpr size_t longest = 40;  // the engine may take long
    if (line.quoting.size() != size || regex.size() > longest || value.size() > longest) {
        return 0;
    }
    const auto constraint = ParameterConstraint::New(CallSpec::ConstraintTypeStringRegex);
    constraint->SetStringRegex(regex);
    if (constraint->Validate(value, "value", CallSpec::Output::New()) &&
        !std::ranges::all_of(value, [&expression](char c) {
            return expression.characters[static_cast<unsigned char>(c)];
        })) {
        std::abort();
    }
    return 0;
}
