#include <author/lint/Xml.h>

#include <libxml/parser.h>
#include <libxml/xmlerror.h>

namespace Author {

namespace {

std::string Text(const xmlChar* text) {
    return text ? reinterpret_cast<const char*>(text) : "";
}

const xmlChar* Name(const char* name) {
    return reinterpret_cast<const xmlChar*>(name);
}

// Later faults are mostly the consequence of the first.
void NoteFirst(void* data, xmlErrorPtr error) {
    auto& fault = *static_cast<XmlFault*>(data);
    if (fault.text.empty() && error->level >= XML_ERR_ERROR) {
        fault = {error->line, ErrorText(*error)};
    }
}

}  // namespace

std::string ErrorText(const xmlError& error) {
    std::string text = error.message ? error.message : "unknown error";
    text.erase(text.find_last_not_of('\n') + 1);
    return text;
}

XmlDocument ReadXml(const std::string& text, XmlFault& fault) {
    xmlSetStructuredErrorFunc(&fault, NoteFirst);
    XmlDocument document(xmlReadMemory(text.data(), static_cast<int>(text.size()), nullptr, nullptr,
                                       XML_PARSE_NONET | XML_PARSE_BIG_LINES));
    xmlSetStructuredErrorFunc(nullptr, nullptr);
    return document;
}

std::string NameOf(const xmlNode* node) {
    return Text(node->name);
}

bool IsElement(const xmlNode* node, const char* name) {
    return node->type == XML_ELEMENT_NODE && xmlStrEqual(node->name, Name(name));
}

std::string Attribute(const xmlNode* node, const char* name) {
    xmlChar* value = xmlGetProp(node, Name(name));
    std::string text = Text(value);
    xmlFree(value);
    return text;
}

std::vector<const xmlNode*> Children(const xmlNode* node, const char* name) {
    std::vector<const xmlNode*> children;
    for (const xmlNode* child = node ? node->children : nullptr; child; child = child->next) {
        if (IsElement(child, name)) {
            children.push_back(child);
        }
    }
    return children;
}

const xmlNode* Child(const xmlNode* node, const char* name) {
    const auto children = Children(node, name);
    return children.empty() ? nullptr : children.front();
}

std::vector<const xmlNode*> Pieces(const xmlNode* node) {
    std::vector<const xmlNode*> pieces;
    for (const xmlNode* child = node ? node->children : nullptr; child; child = child->next) {
        if (child->type != XML_ELEMENT_NODE && child->content) {
            pieces.push_back(child);
        }
    }
    return pieces;
}

std::string Content(const xmlNode* node) {
    const auto pieces = Pieces(node);
    return pieces.empty() ? "" : Text(pieces.back()->content);
}

}  // namespace Author
