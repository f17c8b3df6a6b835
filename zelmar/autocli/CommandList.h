#pragma once

#include <zelmar/autocli/Command.h>

#include <memory>
#include <string>

namespace MetaObj {
class MetaList;
class MetaStruct;
}  // namespace MetaObj

namespace AutoCli {

class Namespace;

/// `kelvash command list`: one row for each command of the tree, depth first and in name order.
/// Each filter that is given must be contained in its text, case and all.
class ZELMAR_EXPORT CommandList : public Command {
public:
    explicit CommandList(Namespace* root) : _root(root) {}
    ~CommandList() override;

    /// `root` must live as long as the command, as it does when the command hangs below it.
    static std::shared_ptr<CommandList> New(std::shared_ptr<Namespace> root);

    /// A new row, of the type `KelVashCommand`, with empty texts.
    static std::shared_ptr<MetaObj::MetaStruct> GetOutputStructure();

    std::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal() override;
    std::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal() override;
    void ExecuteInternal(const std::shared_ptr<CallSpec::Input>& input,
                         const std::shared_ptr<CallSpec::Output>& output) override;

    /// Adds the rows below `node`.
    void AddChildren(const std::string& namespaceFilter, const std::string& commandFilter,
                     const std::string& descriptionFilter, NamespaceNode* node,
                     MetaObj::MetaList* list);

private:
    Namespace* const _root;
};

}  // namespace AutoCli
