#pragma once

#include <zelmar/autocli/NamespaceNode.h>
#include <zelmar/autocli/formatters/FormatParameters.h>
#include <zelmar/callspec/CallTarget.h>
#include <zelmar/callspec/Input.h>
#include <zelmar/callspec/InputSpec.h>
#include <zelmar/callspec/Output.h>
#include <zelmar/callspec/OutputSpec.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace AutoCli {

/// What a command declares, and its place in the tree: a leaf. The operations that would reach a
/// child throw `ZelmarException`, with a text that ends in "Commands cannot have sub-commands or
/// sub-namespaces."
class ZELMAR_EXPORT CommandSpec : public CallSpec::CallTargetSpec, public NamespaceNode {
public:
    CommandSpec() = default;
    ~CommandSpec() override;

    /// The declared parameters and, in every command, `help` with the short name `h`. Built once.
    /// Throws what `GetInputSpecInternal` throws, and what `InputSpec::AddParameter` throws when
    /// the command declares one of these two names itself.
    std::shared_ptr<CallSpec::InputSpec> GetInputSpec() override;
    /// The declared output. Built once.
    std::shared_ptr<CallSpec::OutputSpec> GetOutputSpec() override;

    std::shared_ptr<NamespaceNode> GetThis() override;
    bool HasNamespaceNode(const std::string& name) override;
    std::shared_ptr<NamespaceNode> GetNamespaceNode(const std::string& name) override;
    void RegisterNamespaceNode(std::shared_ptr<NamespaceNode> node, std::string name) override;
    void RegisterNamespaceNode(std::shared_ptr<NamespaceNode> node, const char* name) override;
    std::shared_ptr<NamespaceNode> ResolveNode(std::list<std::string>& path) override;
    Dispatcher* GetDispatcher() override;
    void SetParent(std::shared_ptr<NamespaceNode> parent) override;
    std::shared_ptr<NamespaceNode> GetParent() override;
    NamespaceNodeType GetType() override;

    /// Each command builds its declarations here. They must not be null: who asks for such a one
    /// gets the `ZelmarException` "The command '<path>' declares no input", or "no output".
    virtual std::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal() = 0;
    virtual std::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal() = 0;

    /// The format that the command asks for when the user names none. Without a formatter nothing
    /// is printed.
    void SetDefaultOutputFormatter(std::string name);
    void SetDefaultOutputFormatter(const char* name);
    void SetDefaultOutputParameter(std::string key, std::string value);
    void SetDefaultOutputParameter(const char* key, const char* value);
    [[nodiscard]] FormatParameters GetDefaultOutputFormatParameters() const {
        return _defaultFormat;
    }

    /// An example for the help: the arguments as they would follow the command on a command line,
    /// and the sentence that explains them.
    void AddExample(std::string syntax, std::string description);
    void AddExample(const char* syntax, const char* description);
    [[nodiscard]] const std::vector<std::pair<std::string, std::string>>& GetExamples() const {
        return _examples;
    }

    /// What the command says of itself to the programs around the engine: names with texts, in the
    /// order of their addition; a name may come again. The engine itself heeds none of them. A
    /// descriptor's `meta-data` entries arrive here, and these names have a meaning:
    ///
    ///     read-only           "true": the command changes nothing
    ///     values:<parameter>  where the values that exist are found, as `SetValuesSource` tells
    ///     example             a further example, for reference pages: the arguments as they would
    ///                         follow the command, " : ", and the sentence that explains them
    void AddMetaData(std::string name, std::string text);
    [[nodiscard]] const std::vector<std::pair<std::string, std::string>>& GetMetaData() const {
        return _metaData;
    }

    /// Promises that the command changes nothing on the machine. False unless it was promised.
    void SetReadOnly() { AddMetaData("read-only", "true"); }
    [[nodiscard]] bool IsReadOnly() const;

    /// Where the values that exist for a parameter are found, for completion: a command that needs
    /// no parameter and a field of what it gives, as in "account user list:Name". Empty when
    /// nothing was said; the first of several counts.
    void SetValuesSource(const std::string& parameter, std::string source);
    [[nodiscard]] std::string GetValuesSource(const std::string& parameter) const;

    /// Sets the help of this command as the output's value, a struct of the type
    /// `KelVashCommandHelp`, and marks the output as help. The usage shows when `input` is a
    /// `CommandInput`.
    void GenerateHelpOutput(const std::shared_ptr<CallSpec::Input>& input,
                            const std::shared_ptr<CallSpec::Output>& output);

private:
    [[nodiscard]] std::string GetMetaData(const std::string& name) const;

    std::vector<std::pair<std::string, std::string>> _examples;
    std::vector<std::pair<std::string, std::string>> _metaData;
    std::shared_ptr<CallSpec::InputSpec> _inputSpec;
    std::shared_ptr<CallSpec::OutputSpec> _outputSpec;
    FormatParameters _defaultFormat;
    std::weak_ptr<NamespaceNode> _parent;
};

}  // namespace AutoCli
