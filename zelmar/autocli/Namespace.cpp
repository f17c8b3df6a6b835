#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/Namespace.h>

using Zelmar::ZelmarException;

namespace AutoCli {

Namespace::~Namespace() = default;

std::shared_ptr<Namespace> Namespace::New() {
    return std::make_shared<Namespace>();
}

std::shared_ptr<NamespaceNode> Namespace::GetThis() {
    return shared_from_this();
}

NamespaceNodeType Namespace::GetType() {
    return NodeTypeNamespace;
}

Dispatcher* Namespace::GetDispatcher() {
    const auto parent = GetParent();
    if (!parent) {
        throw ZelmarException(
            "Invalid state for namespace '" + GetName() +
            "no parent has been set while attempting to get dispathcer reference.");
    }
    return parent->GetDispatcher();
}

void Namespace::SetParent(std::shared_ptr<NamespaceNode> parent) {
    _parent = parent;
}

std::shared_ptr<NamespaceNode> Namespace::GetParent() {
    return _parent.lock();
}

RootNamespace::~RootNamespace() {
    DropChildren();
}

std::shared_ptr<RootNamespace> RootNamespace::New(Dispatcher* dispatcher) {
    return std::make_shared<RootNamespace>(dispatcher);
}

std::shared_ptr<NamespaceNode> RootNamespace::GetThis() {
    return shared_from_this();
}

NamespaceNodeType RootNamespace::GetType() {
    return NodeTypeRoot;
}

std::list<std::string> RootNamespace::GetPath() {
    return {};
}

std::string RootNamespace::GetPathString(char /*separator*/) {
    return "";
}

Dispatcher* RootNamespace::GetDispatcher() {
    return _dispatcher;
}

void RootNamespace::SetParent(std::shared_ptr<NamespaceNode> /*parent*/) {
    throw ZelmarException("Error, Root namespace cannot be assigned a parent node");
}

std::shared_ptr<NamespaceNode> RootNamespace::GetParent() {
    return nullptr;
}

}  // namespace AutoCli
