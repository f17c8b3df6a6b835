#pragma once

#include <zelmar/Export.h>

#include <list>
#include <map>
#include <memory>
#include <string>
#include <vector>

namespace AutoCli {

class Dispatcher;

enum NamespaceNodeType : int {
    NodeTypeRoot = 0,
    NodeTypeNamespace = 1,
    NodeTypeCommand = 2,
};

/// The rule on a node's name, which is one level of a path: ASCII letters and digits; a capital
/// stands only behind a small letter or a digit. Time is linear in the length of the name.
ZELMAR_EXPORT bool AutoCli_IsValidName(const std::string& name);

/// A node of the tree of commands. A parent owns its children and a child points back weakly; a
/// node must be owned by a shared pointer before it gets children. A node stays free, without name
/// and parent, until it is registered, and is never taken out again.
class ZELMAR_EXPORT NamespaceNode : public std::enable_shared_from_this<NamespaceNode> {
public:
    NamespaceNode() = default;
    NamespaceNode(const NamespaceNode&) = delete;
    NamespaceNode& operator=(const NamespaceNode&) = delete;
    virtual ~NamespaceNode();

    /// This node, sharing ownership. Throws `std::bad_weak_ptr` when no shared pointer owns it.
    virtual std::shared_ptr<NamespaceNode> GetThis() = 0;
    virtual NamespaceNodeType GetType() = 0;

    /// The names from the root's child down to this node; the root's own are empty. Throw
    /// `ZelmarException` when the node hangs in no tree: "GetPath: Invalid state for Namespace Node
    /// with the name '<name>' No parent node has been set"; the second begins "GetPathString: ".
    virtual std::list<std::string> GetPath();
    virtual std::string GetPathString(char separator);

    /// Children, in ascending byte order of their names. An absent one is null.
    virtual bool HasNamespaceNode(const std::string& name);
    virtual std::vector<std::string> GetNamespaceNodeNames();
    virtual std::vector<std::shared_ptr<NamespaceNode>> GetNamespaceNodes();
    virtual std::shared_ptr<NamespaceNode> GetNamespaceNode(const std::string& name);

    /// Adds a child under one name. Throws `ZelmarException`, and changes nothing: "Duplicate
    /// registration in namespace <path> attempt to register two objects with name <name>"; "Null
    /// namespace node named '<name>' passed to namespace <path>"; what `SetName` throws.
    virtual void RegisterNamespaceNode(std::shared_ptr<NamespaceNode> node, std::string name);
    virtual void RegisterNamespaceNode(std::shared_ptr<NamespaceNode> node, const char* name);

    /// The node at the end of the path; null for an empty path. The list is as before when the call
    /// succeeds; a failure takes away the names down to the level that failed. Throws
    /// `ZelmarException`: "Unable to find a command or namespace with the name '<name>' in
    /// namespace <path>".
    virtual std::shared_ptr<NamespaceNode> ResolveNode(std::list<std::string>& path);

    /// The child of that name, of whatever type; a new namespace when there is none.
    virtual std::shared_ptr<NamespaceNode> SubNamespace(const std::string& name);

    /// The dispatcher at the root of the tree. Throws `ZelmarException` when there is no parent.
    virtual Dispatcher* GetDispatcher() = 0;
    virtual void SetParent(std::shared_ptr<NamespaceNode> parent) = 0;
    /// Null when none was set or it is gone.
    virtual std::shared_ptr<NamespaceNode> GetParent() = 0;

    [[nodiscard]] const std::string& GetName() const { return _name; }
    /// Throws `ZelmarException`: "Invalid name for namespace '<name>', must be a name consisting of
    /// letters and numbers and must conform to 'camel' casing." The parent knows the node by the
    /// name of its registration, whatever is set later.
    void SetName(const std::string& name);

    void SetDescription(std::string description) { _description = std::move(description); }
    void SetDescription(const char* description) { _description = description; }
    [[nodiscard]] const std::string& GetDescription() const { return _description; }

protected:
    /// Releases all children now.
    void DropChildren() { _children.clear(); }

private:
    std::string _name;
    std::string _description;
    std::map<std::string, std::shared_ptr<NamespaceNode>> _children;
};

}  // namespace AutoCli
