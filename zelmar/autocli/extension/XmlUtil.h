#pragma once

#include <zelmar/autocli/extension/XmlReader.h>

// Readers of single nodes, whose children somebody keeps. Nothing is trimmed, and what is absent
// reads as an empty text. Names are compared exactly.

namespace AutoCli {

/// Is it more than text, a comment or a CDATA section? An element of one of these names counts as
/// such, too.
[[nodiscard]] bool XmlUtil_IsTagged(const XmlNode& node);

[[nodiscard]] std::string_view XmlUtil_ExtractAttribute(const XmlNode& node, std::string_view name);

/// The content of the last child that has one: texts, CDATA sections, comments and references do.
[[nodiscard]] std::optional<std::string_view> XmlUtil_FindContent(const XmlNode& node);
[[nodiscard]] std::string_view XmlUtil_GetContent(const XmlNode& node);

/// The content of the child of that name. Throws `ZelmarException` when there is another one behind
/// one that is not empty: "Illegal Duplicate tags found.  The tag <tag> was expected only once, but
/// was found multiple times."
[[nodiscard]] std::string_view XmlUtil_GetContentForChildByTag(const XmlNode& node,
                                                               std::string_view tag);

/// The child of that name, or null. Throws `ZelmarException`: "More than one instance of <tag>
/// found, expected only one."
[[nodiscard]] const XmlNode* XmlUtil_FindChildNode(const XmlNode& node, std::string_view tag);

}  // namespace AutoCli
