#pragma once

#include <libxml/tree.h>

#include <memory>
#include <string>
#include <vector>

namespace Author {

struct XmlDocumentDeleter {
    void operator()(xmlDoc* document) const { xmlFreeDoc(document); }
};
using XmlDocument = std::unique_ptr<xmlDoc, XmlDocumentDeleter>;

/// A failure while text is read: where, and libxml2's words for it, without its line end.
struct XmlFault {
    long line = 0;
    std::string text;
};

/// The document in a text; else null, with the first thing that is wrong with it. Nothing is
/// fetched, and nothing is printed.
XmlDocument ReadXml(const std::string& text, XmlFault& fault);

/// The text of a libxml2 error without its line end.
std::string ErrorText(const xmlError& error);

std::string NameOf(const xmlNode* node);
bool IsElement(const xmlNode* node, const char* name);
/// An absent attribute is empty.
std::string Attribute(const xmlNode* node, const char* name);
/// The child elements of that name, in the order of the file.
std::vector<const xmlNode*> Children(const xmlNode* node, const char* name);
/// The first of them, or null.
const xmlNode* Child(const xmlNode* node, const char* name);
/// The pieces of text, CDATA and comments in an element. The engine reads the last one alone.
std::vector<const xmlNode*> Pieces(const xmlNode* node);
/// What the engine reads as the content of an element; empty for null.
std::string Content(const xmlNode* node);

}  // namespace Author
