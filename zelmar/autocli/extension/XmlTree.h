#pragma once

#include <zelmar/autocli/extension/XmlReader.h>

#include <memory_resource>
#include <vector>

namespace AutoCli {

/// Keeps what it is told of, for those who look at elements in another order than that of the file.
/// Its nodes and their texts live as long as it does.
class XmlTree : public XmlEvents {
public:
    XmlTree() = default;
    /// A copy of an element that libxml2 keeps.
    explicit XmlTree(const _xmlNode* node) { XmlUtil_ReadNode(node, *this); }

    void Open(const XmlNode& element) override;
    void Close() override { _open.pop_back(); }
    void Leaf(const XmlNode& node) override { Append(node); }

    /// Null before anything was told.
    [[nodiscard]] const XmlNode* GetRoot() const { return _document.firstChild; }

private:
    XmlNode& Append(const XmlNode& node);
    std::string_view Copy(std::string_view text);

    // Nodes are many and small, and go together.
    std::pmr::monotonic_buffer_resource _memory;
    XmlNode _document;
    // Of each open node, where its next child goes.
    std::vector<const XmlNode**> _open = {&_document.firstChild};
};

}  // namespace AutoCli
