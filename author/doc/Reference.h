#pragma once

#include <zelmar/zelmar.h>

#include <nlohmann/json.hpp>

#include <functional>
#include <string>

namespace Author {

using Json = nlohmann::ordered_json;

/// Everything that is declared at a node of the tree and below it, as doc.schema.json tells. Each
/// namespace comes with its commands before the namespaces in it, by name. All texts are valid
/// UTF-8. A command whose declarations cannot be built is left out, and told to `leftOut` with the
/// reason.
Json MakeReference(AutoCli::NamespaceNode& node,
                   const std::function<void(const std::string&)>& leftOut);

/// The words of a path, with this between them.
std::string Joined(const Json& words, const std::string& between);
/// "string, required, repeated, secret", as far as it holds for the parameter.
std::string KindOf(const Json& parameter);
/// "[--kind STRING]...", as it stands in a usage line; without brackets where it is required.
std::string UsageOf(const Json& parameter);
/// "from 1 to 5", of a constraint with bounds.
std::string RangeOf(const Json& constraint);
/// A value that a constraint lists, as it is typed.
std::string ValueOf(const Json& value);
/// What a value is: "int", "structure User", "list of string".
std::string ShapeWords(const Json& shape);
/// The fields of a structure, or of the structures in a list; else an empty list.
const Json& FieldsOf(const Json& shape);
/// The text on one line, with single blanks; control characters become blanks, too.
std::string OneLine(const std::string& text);

}  // namespace Author
