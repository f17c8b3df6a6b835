#include <zelmar/autocli/extension/XmlTree.h>

#include <algorithm>
#include <new>

namespace AutoCli {

void XmlTree::Open(const XmlNode& element) {
    _open.push_back(&Append(element).firstChild);
}

XmlNode& XmlTree::Append(const XmlNode& node) {
    std::pmr::polymorphic_allocator<> allocator(&_memory);
    auto* attributes = allocator.allocate_object<XmlNode::Attribute>(node.attributes.size());
    std::ranges::transform(node.attributes, attributes, [this](const auto& attribute) {
        return XmlNode::Attribute{Copy(attribute.name), Copy(attribute.value)};
    });
    auto* copy = allocator.new_object<XmlNode>(
        XmlNode{.name = Copy(node.name), .attributes = {attributes, node.attributes.size()}});
    if (node.content) {
        copy->content = Copy(*node.content);
    }
    *_open.back() = copy;
    _open.back() = &copy->next;
    return *copy;
}

std::string_view XmlTree::Copy(std::string_view text) {
    auto* copy = static_cast<char*>(_memory.allocate(text.size(), 1));
    std::ranges::copy(text, copy);
    return {copy, text.size()};
}

}  // namespace AutoCli
