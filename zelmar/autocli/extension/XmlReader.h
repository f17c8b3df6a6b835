#pragma once

#include <optional>
#include <span>
#include <string>
#include <string_view>

struct _xmlNode;  // NOLINT(bugprone-reserved-identifier): the name that libxml2 gives it

// Documents without a tree: who reads one is told of each node as the parser comes by it. A script
// may print a hundred megabytes; they are never in memory a second time.

namespace AutoCli {

/// An element, or what can stand in one. A text is called "text", a comment "comment", and a CDATA
/// section has no name; an instruction has its target for a name, a reference its entity. None of
/// them is told from an element of the same name. The views last as long as the node does.
struct XmlNode {
    struct Attribute {
        std::string_view name;
        std::string_view value;
    };

    class Iterator {
    public:
        explicit Iterator(const XmlNode* node) : _node(node) {}
        const XmlNode& operator*() const { return *_node; }
        Iterator& operator++() {
            _node = _node->next;
            return *this;
        }
        bool operator==(const Iterator& other) const = default;

    private:
        const XmlNode* _node;
    };

    /// The children, as far as somebody keeps them.
    [[nodiscard]] Iterator begin() const { return Iterator(firstChild); }
    [[nodiscard]] Iterator end() const { return Iterator(nullptr); }

    std::string_view name;
    std::optional<std::string_view> content = {};  ///< elements have none
    std::span<const Attribute> attributes = {};
    const XmlNode* firstChild = nullptr;
    const XmlNode* next = nullptr;
};

/// What a document holds, from its root element on. The nodes given have no children and do not
/// outlive the call. After a throw nothing more is told.
class XmlEvents {
public:
    virtual ~XmlEvents() = default;

    virtual void Open(const XmlNode& element) = 0;
    virtual void Close() = 0;
    /// Anything but an element. Text that no other node parts is one node.
    virtual void Leaf(const XmlNode& node) = 0;
};

/// False when the text is not well-formed, of which libxml2 tells the details on the error stream;
/// `name` stands for the text there. What was told of such a document means nothing, and what
/// `events` threw is lost. Else that is thrown, once the whole text is known to be well-formed.
///
/// What a document declares for itself, entities and defaults of attributes, can be far longer
/// where it is used than the document is. Throws `ZelmarException`: "The declarations of the
/// document stand for more than 10000000 bytes", and where libxml2 takes a part for the document:
/// "There was not enough memory for the whole document", "The document could not be read to its
/// end".
[[nodiscard]] bool XmlUtil_ReadText(std::string_view text, const char* name, XmlEvents& events);

/// The same for a file; the path is never taken for an address. False, too, when there is none.
[[nodiscard]] bool XmlUtil_ReadFile(const std::string& path, XmlEvents& events);

/// The same for an element of a tree that libxml2 made.
void XmlUtil_ReadNode(const _xmlNode* node, XmlEvents& events);

}  // namespace AutoCli
