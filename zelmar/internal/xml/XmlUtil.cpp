#include <zelmar/ZelmarException.h>
#include <zelmar/internal/xml/XmlUtil.h>

using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

const char* Chars(const xmlChar* text) {
    return reinterpret_cast<const char*>(text);
}

// What a document declares for itself, entities and defaults of attributes, can be far longer where
// it is used than the document is. The parser does not count that, since it leaves references as
// they are; so it is counted here, in the field of a document that the parser leaves to its users.
void Count(const xmlNode* user, size_t bytes) {
    constexpr size_t limit = 10'000'000;
    void*& counter = user->doc->_private;
    const size_t sum = reinterpret_cast<size_t>(counter) + bytes;
    if (sum > limit) {
        throw ZelmarException("The declarations of the document stand for more than " +
                              std::to_string(limit) + " bytes");
    }
    counter = reinterpret_cast<void*>(sum);  // NOLINT(performance-no-int-to-ptr): no pointer
}

std::string Counted(const xmlNode* user, std::string text) {
    Count(user, text.size());
    return text;
}

void AppendExpanded(const xmlNode* nodes, std::string& text) {
    for (const xmlNode* node = nodes; node; node = node->next) {
        if (node->type == XML_ENTITY_REF_NODE) {
            Count(node, 1);
            if (const xmlEntity* entity = xmlGetDocEntity(node->doc, node->name)) {
                AppendExpanded(entity->children, text);
            }
        } else if (node->content) {
            text += Counted(node, Chars(node->content));
        }
    }
}

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
    const xmlAttr* attribute = xmlHasProp(node, reinterpret_cast<const xmlChar*>(name.c_str()));
    if (!attribute) {
        return {};
    }
    if (attribute->type == XML_ATTRIBUTE_DECL) {
        const auto* declared = reinterpret_cast<const xmlAttribute*>(attribute);
        return Counted(node, Chars(declared->defaultValue));
    }
    const xmlNode* value = attribute->children;
    if (value && value->type == XML_TEXT_NODE && !value->next) {
        return Chars(value->content);
    }
    std::string expanded;
    AppendExpanded(value, expanded);
    return expanded;
}

std::string XmlUtil_GetText(const xmlNode* node) {
    const char* text = Chars(node->content);
    return node->type == XML_ENTITY_REF_NODE ? Counted(node, text) : text;
}

std::string XmlUtil_GetContent(const xmlNode* node) {
    const xmlNode* last = nullptr;
    XmlUtil_ForEachChild(node, [&last](const xmlNode* child) {
        if (child->content) {
            last = child;
        }
    });
    return last ? XmlUtil_GetText(last) : std::string();
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
