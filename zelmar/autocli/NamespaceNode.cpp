#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/Namespace.h>
#include <zelmar/autocli/NamespaceNode.h>
#include <zelmar/internal/Ascii.h>

using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

std::shared_ptr<NamespaceNode> RequireParent(NamespaceNode& node, const char* operation) {
    auto parent = node.GetParent();
    if (!parent) {
        throw ZelmarException(std::string(operation) +
                              ": Invalid state for Namespace Node with the name '" +
                              node.GetName() + "' No parent node has been set");
    }
    return parent;
}

}  // namespace

bool AutoCli_IsValidName(const std::string& name) {
    char previous = 'A';  // a capital cannot stand in front
    for (const char c : name) {
        if (!Ascii::IsAlnum(c) || (Ascii::IsUpper(c) && Ascii::IsUpper(previous))) {
            return false;
        }
        previous = c;
    }
    return !name.empty();
}

NamespaceNode::~NamespaceNode() = default;

std::list<std::string> NamespaceNode::GetPath() {
    auto path = RequireParent(*this, "GetPath")->GetPath();
    path.push_back(_name);
    return path;
}

std::string NamespaceNode::GetPathString(char separator) {
    std::string path = RequireParent(*this, "GetPathString")->GetPathString(separator);
    if (!path.empty()) {
        path += separator;
    }
    return path + _name;
}

bool NamespaceNode::HasNamespaceNode(const std::string& name) {
    return _children.contains(name);
}

std::vector<std::string> NamespaceNode::GetNamespaceNodeNames() {
    std::vector<std::string> names;
    names.reserve(_children.size());
    for (const auto& [name, child] : _children) {
        names.push_back(name);
    }
    return names;
}

std::vector<std::shared_ptr<NamespaceNode>> NamespaceNode::GetNamespaceNodes() {
    std::vector<std::shared_ptr<NamespaceNode>> nodes;
    nodes.reserve(_children.size());
    for (const auto& [name, child] : _children) {
        nodes.push_back(child);
    }
    return nodes;
}

std::shared_ptr<NamespaceNode> NamespaceNode::GetNamespaceNode(const std::string& name) {
    const auto child = _children.find(name);
    return child == _children.end() ? nullptr : child->second;
}

void NamespaceNode::RegisterNamespaceNode(std::shared_ptr<NamespaceNode> node, std::string name) {
    if (HasNamespaceNode(name)) {
        throw ZelmarException("Duplicate registration in namespace " + GetPathString(' ') +
                              " attempt to register two objects with name " + name);
    }
    if (!node) {
        throw ZelmarException("Null namespace node named '" + name + "' passed to namespace " +
                              GetPathString(' '));
    }
    node->SetName(name);
    node->SetParent(GetThis());
    _children.emplace(std::move(name), std::move(node));
}

void NamespaceNode::RegisterNamespaceNode(std::shared_ptr<NamespaceNode> node, const char* name) {
    RegisterNamespaceNode(std::move(node), std::string(name));
}

std::shared_ptr<NamespaceNode> NamespaceNode::ResolveNode(std::list<std::string>& path) {
    if (path.empty()) {
        return nullptr;
    }
    std::string name = std::move(path.front());
    path.pop_front();
    auto node = GetNamespaceNode(name);
    if (!node) {
        throw ZelmarException("Unable to find a command or namespace with the name '" + name +
                              "' in namespace " + GetPathString(' '));
    }
    if (!path.empty()) {
        node = node->ResolveNode(path);
    }
    path.push_front(std::move(name));
    return node;
}

std::shared_ptr<NamespaceNode> NamespaceNode::SubNamespace(const std::string& name) {
    auto node = GetNamespaceNode(name);
    if (!node) {
        node = Namespace::New();
        RegisterNamespaceNode(node, name);
    }
    return node;
}

void NamespaceNode::SetName(const std::string& name) {
    if (!AutoCli_IsValidName(name)) {
        throw ZelmarException("Invalid name for namespace '" + name +
                              "', must be a name consisting of letters and numbers and must"
                              " conform to 'camel' casing.");
    }
    _name = name;
}

}  // namespace AutoCli
