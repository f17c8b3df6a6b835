#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/XmlUtil.h>

#include <algorithm>

using Zelmar::ZelmarException;

namespace AutoCli {

bool XmlUtil_IsTagged(const XmlNode& node) {
    return !node.name.empty() && node.name != "text" && node.name != "comment";
}

std::string_view XmlUtil_ExtractAttribute(const XmlNode& node, std::string_view name) {
    const auto attribute = std::ranges::find(node.attributes, name, &XmlNode::Attribute::name);
    return attribute == node.attributes.end() ? std::string_view() : attribute->value;
}

std::optional<std::string_view> XmlUtil_FindContent(const XmlNode& node) {
    std::optional<std::string_view> last;
    for (const XmlNode& child : node) {
        last = child.content ? child.content : last;
    }
    return last;
}

std::string_view XmlUtil_GetContent(const XmlNode& node) {
    return XmlUtil_FindContent(node).value_or(std::string_view());
}

std::string_view XmlUtil_GetContentForChildByTag(const XmlNode& node, std::string_view tag) {
    std::string_view content;
    for (const XmlNode& child : node) {
        if (child.name != tag) {
            continue;
        }
        if (!content.empty()) {
            throw ZelmarException("Illegal Duplicate tags found.  The tag " + std::string(tag) +
                                  " was expected only once, but was found multiple times.");
        }
        content = XmlUtil_GetContent(child);
    }
    return content;
}

const XmlNode* XmlUtil_FindChildNode(const XmlNode& node, std::string_view tag) {
    const XmlNode* found = nullptr;
    for (const XmlNode& child : node) {
        if (child.name != tag) {
            continue;
        }
        if (found) {
            throw ZelmarException("More than one instance of " + std::string(tag) +
                                  " found, expected only one.");
        }
        found = &child;
    }
    return found;
}

}  // namespace AutoCli
