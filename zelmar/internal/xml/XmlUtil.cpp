#include <zelmar/ZelmarException.h>
#include <zelmar/internal/xml/XmlUtil.h>

using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

const char* Chars(const xmlChar* text) {
    return reinterpret_cast<const char*>(text);
}

struct XmlTextDeleter {
    void operator()(xmlChar* text) const { xmlFree(text); }
};

}  // namespace

std::string_view XmlUtil_GetName(const xmlNode* node) {
    return node->name ? Chars(node->name) : std::string_view();
}

const xmlNode* XmlUtil_GetFirstChild(const xmlNode* node) {
    return node->type == XML_ELEMENT_NODE ? node->children : nullptr;
}

bool XmlUtil_IsTagged(const xmlNode* node) {
    const std::string_view name = XmlUtil_GetName(node);
    return !name.empty() && name != "text" && name != "comment";
}

std::string XmlUtil_ExtractAttribute(const xmlNode* node, const std::string& name) {
    const std::unique_ptr<xmlChar, XmlTextDeleter> value(
        xmlGetProp(node, reinterpret_cast<const xmlChar*>(name.c_str())));
    return value ? Chars(value.get()) : std::string();
}

std::string XmlUtil_GetContent(const xmlNode* node) {
    const xmlChar* content = nullptr;
    XmlUtil_ForEachChild(node, [&content](const xmlNode* child) {
        if (child->content) {
            content = child->content;
        }
    });
    return content ? Chars(content) : std::string();
}

std::string XmlUtil_GetContentForChildByTag(const xmlNode* node, const std::string& tag) {
    std::string content;
    XmlUtil_ForEachChild(node, tag, [&](const xmlNode* child) {
        if (!content.empty()) {
            throw ZelmarException("Illegal Duplicate tags found.  The tag " + tag +
                                  " was expected only once, but was found multiple times.");
        }
        content = XmlUtil_GetContent(child);
    });
    return content;
}

const xmlNode* XmlUtil_FindChildNode(const xmlNode* node, const std::string& tag) {
    const xmlNode* found = nullptr;
    XmlUtil_ForEachChild(node, tag, [&](const xmlNode* child) {
        if (found) {
            throw ZelmarException("More than one instance of " + tag +
                                  " found, expected only one.");
        }
        found = child;
    });
    return found;
}

}  // namespace AutoCli
