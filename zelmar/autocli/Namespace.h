#pragma once

#include <zelmar/autocli/NamespaceNode.h>

#include <memory>
#include <string>
#include <vector>

namespace AutoCli {

/// An inner node of the tree.
class ZELMAR_EXPORT Namespace : public NamespaceNode {
public:
    Namespace() = default;
    ~Namespace() override;

    static std::shared_ptr<Namespace> New();

    std::shared_ptr<NamespaceNode> GetThis() override;
    NamespaceNodeType GetType() override;

    /// Throws `ZelmarException` when there is no parent: "Invalid state for namespace '<name>no
    /// parent has been set while attempting to get dispathcer reference."
    Dispatcher* GetDispatcher() override;
    void SetParent(std::shared_ptr<NamespaceNode> parent) override;
    std::shared_ptr<NamespaceNode> GetParent() override;

private:
    std::weak_ptr<NamespaceNode> _parent;
};

/// The root of a dispatcher's tree. It has no name and shows in no path.
class ZELMAR_EXPORT RootNamespace : public Namespace {
public:
    explicit RootNamespace(Dispatcher* dispatcher) : _dispatcher(dispatcher) {}
    /// The children go first, then what `KeepAlive` was given.
    ~RootNamespace() override;

    /// The dispatcher owns the root and not the other way round.
    static std::shared_ptr<RootNamespace> New(Dispatcher* dispatcher);

    std::shared_ptr<NamespaceNode> GetThis() override;
    NamespaceNodeType GetType() override;
    std::list<std::string> GetPath() override;
    std::string GetPathString(char separator) override;
    Dispatcher* GetDispatcher() override;
    /// Always throws `ZelmarException`: "Error, Root namespace cannot be assigned a parent node".
    void SetParent(std::shared_ptr<NamespaceNode> parent) override;
    std::shared_ptr<NamespaceNode> GetParent() override;

    /// Shares in what the nodes of the tree need for as long as they live, such as a loaded shared
    /// object that holds their code.
    void KeepAlive(std::shared_ptr<void> resource) { _keptAlive.push_back(std::move(resource)); }

private:
    Dispatcher* const _dispatcher;
    std::vector<std::shared_ptr<void>> _keptAlive;
};

}  // namespace AutoCli
