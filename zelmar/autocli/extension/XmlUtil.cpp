#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/XmlUtil.h>

#include <cstring>

using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

const char* Chars(const xmlChar* text) {
    return reinterpret_cast<const char*>(text);
}

// Sums up what the declarations of a document stand for at the places where its elements use them.
class DeclaredText {
public:
    void AddElement(const xmlNode* element) {
        for (const xmlAttr* attribute = element->properties; attribute;
             attribute = attribute->next) {
            AddReferences(attribute->children);
        }
        AddDefaults(xmlGetDtdElementDesc(element->doc->intSubset, element->name));
        AddReferences(element->children);
        XmlUtil_ForEachChild(element, [this](const xmlNode* child) {
            if (child->type == XML_ELEMENT_NODE) {
                AddElement(child);
            }
        });
    }

private:
    // An entity may hold references in turn.
    void AddReferences(const xmlNode* nodes) {
        for (const xmlNode* node = nodes; node; node = node->next) {
            if (node->type == XML_ENTITY_REF_NODE) {
                Add(node->content);
                const xmlEntity* entity = xmlGetDocEntity(node->doc, node->name);
                AddReferences(entity ? entity->children : nullptr);
            }
        }
    }

    void AddDefaults(const xmlElement* declaration) {
        const xmlAttribute* attribute = declaration ? declaration->attributes : nullptr;
        for (; attribute; attribute = attribute->nexth) {
            Add(attribute->defaultValue);
        }
    }

    // Each place counts, so that the sum bounds the time it takes as well.
    void Add(const xmlChar* text) {
        constexpr size_t limit = 10'000'000;
        _bytes += 1 + (text ? std::strlen(Chars(text)) : 0);
        if (_bytes > limit) {
            throw ZelmarException("The declarations of the document stand for more than " +
                                  std::to_string(limit) + " bytes");
        }
    }

    size_t _bytes = 0;
};

// As `xmlNodeListGetString` does, in linear time.
void AppendExpanded(const xmlNode* nodes, std::string& text) {
    for (const xmlNode* node = nodes; node; node = node->next) {
        if (node->type == XML_ENTITY_REF_NODE) {
            const xmlEntity* entity = xmlGetDocEntity(node->doc, node->name);
            AppendExpanded(entity ? entity->children : nullptr, text);
        } else if (node->content) {
            text += Chars(node->content);
        }
    }
}

}  // namespace

void XmlUtil_CheckDeclarations(const xmlDoc* document) {
    if (document->intSubset) {
        DeclaredText().AddElement(xmlDocGetRootElement(document));
    }
}

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
        return Chars(reinterpret_cast<const xmlAttribute*>(attribute)->defaultValue);
    }
    std::string value;
    AppendExpanded(attribute->children, value);
    return value;
}

std::string XmlUtil_GetText(const xmlNode* node) {
    return node->content ? Chars(node->content) : "";
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
