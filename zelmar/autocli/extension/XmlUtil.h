#pragma once

#include <libxml/tree.h>

#include <memory>
#include <string>
#include <string_view>

// Readers of single nodes. Nothing is trimmed, and what is absent reads as an empty string. Names
// are compared exactly; a node without a name, which a CDATA section is, has an empty one and so
// matches none.

namespace AutoCli {

struct XmlDocumentDeleter {
    void operator()(xmlDoc* document) const { xmlFreeDoc(document); }
};

/// Owns a parsed document and with it all its nodes.
using XmlDocument = std::unique_ptr<xmlDoc, XmlDocumentDeleter>;

/// What a document declares for itself, entities and defaults of attributes, can be far longer
/// where it is used than the document is. The parser does not count that, since it leaves
/// references as they are; to be called before anything is read from a document of foreign origin.
/// Throws `ZelmarException`: "The declarations of the document stand for more than 10000000 bytes".
void XmlUtil_CheckDeclarations(const xmlDoc* document);

[[nodiscard]] std::string_view XmlUtil_GetName(const xmlNode* node);

/// The first child of an element, and null for any other node: below a reference to an entity hang
/// the declarations of the document's own DTD, which are no nodes of the tree.
[[nodiscard]] const xmlNode* XmlUtil_GetFirstChild(const xmlNode* node);

/// Is it more than text or a comment? An element of one of these names counts as such, too.
[[nodiscard]] bool XmlUtil_IsTagged(const xmlNode* node);

[[nodiscard]] std::string XmlUtil_ExtractAttribute(const xmlNode* node, const std::string& name);

/// The content of a node that has one: texts, CDATA sections, comments and references do.
[[nodiscard]] std::string XmlUtil_GetText(const xmlNode* node);

/// The content of the last child that has one.
[[nodiscard]] std::string XmlUtil_GetContent(const xmlNode* node);

/// The content of the child of that name. Throws `ZelmarException` when there is another one behind
/// one that is not empty: "Illegal Duplicate tags found.  The tag <tag> was expected only once, but
/// was found multiple times."
[[nodiscard]] std::string XmlUtil_GetContentForChildByTag(const xmlNode* node,
                                                          const std::string& tag);

/// The child of that name, or null. Throws `ZelmarException`: "More than one instance of <tag>
/// found, expected only one."
[[nodiscard]] const xmlNode* XmlUtil_FindChildNode(const xmlNode* node, const std::string& tag);

/// Calls `visit` with each child, in order.
template <class Visit>
void XmlUtil_ForEachChild(const xmlNode* node, Visit visit) {
    for (const xmlNode* child = XmlUtil_GetFirstChild(node); child; child = child->next) {
        visit(child);
    }
}

/// The same with each child of that name.
template <class Visit>
void XmlUtil_ForEachChild(const xmlNode* node, std::string_view tag, Visit visit) {
    XmlUtil_ForEachChild(node, [&](const xmlNode* child) {
        if (XmlUtil_GetName(child) == tag) {
            visit(child);
        }
    });
}

}  // namespace AutoCli
