#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/CommandSpec.h>

#include <boost/algorithm/string/join.hpp>

#include <algorithm>

using CallSpec::InputSpec;
using CallSpec::OutputSpec;
using CallSpec::ParameterSpec;
using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

ZelmarException HasNoNode(CommandSpec& command, const std::string& name) {
    return ZelmarException("Unable to find a namespace or command with the name '" + name +
                           "' on the command '" + command.GetPathString(' ') +
                           "'. Commands cannot have sub-commands or sub-namespaces.");
}

std::shared_ptr<ParameterSpec> HelpParameter() {
    auto help = ParameterSpec::New("help", CallSpec::ParameterTypeBool);
    help->SetShortName("h");
    help->SetDescription("Show the help message.");
    help->SetRequired(false);
    return help;
}

}  // namespace

CommandSpec::~CommandSpec() = default;

std::shared_ptr<InputSpec> CommandSpec::GetInputSpec() {
    if (!_inputSpec) {
        _inputSpec = GetInputSpecInternal();
        if (!_inputSpec) {
            throw ZelmarException("The command '" + GetPathString(' ') + "' declares no input");
        }
        _inputSpec->AddParameter(HelpParameter());
    }
    return _inputSpec;
}

std::shared_ptr<OutputSpec> CommandSpec::GetOutputSpec() {
    if (!_outputSpec) {
        _outputSpec = GetOutputSpecInternal();
        if (!_outputSpec) {
            throw ZelmarException("The command '" + GetPathString(' ') + "' declares no output");
        }
    }
    return _outputSpec;
}

std::shared_ptr<NamespaceNode> CommandSpec::GetThis() {
    return shared_from_this();
}

bool CommandSpec::HasNamespaceNode(const std::string& /*name*/) {
    return false;
}

std::shared_ptr<NamespaceNode> CommandSpec::GetNamespaceNode(const std::string& name) {
    throw HasNoNode(*this, name);
}

void CommandSpec::RegisterNamespaceNode(std::shared_ptr<NamespaceNode> /*node*/, std::string name) {
    throw ZelmarException("Attempt to register a command or namespace '" + name + "' on command '" +
                          GetPathString(' ') +
                          "'. Commands cannot have sub-commands or sub-namespaces.");
}

void CommandSpec::RegisterNamespaceNode(std::shared_ptr<NamespaceNode> node, const char* name) {
    RegisterNamespaceNode(std::move(node), std::string(name));
}

std::shared_ptr<NamespaceNode> CommandSpec::ResolveNode(std::list<std::string>& path) {
    throw HasNoNode(*this, boost::algorithm::join(path, " "));
}

Dispatcher* CommandSpec::GetDispatcher() {
    const auto parent = GetParent();
    if (!parent) {
        throw ZelmarException("Invalid state for command with name '" + GetName() +
                              "'. No parent node has been set.");
    }
    return parent->GetDispatcher();
}

void CommandSpec::SetParent(std::shared_ptr<NamespaceNode> parent) {
    _parent = parent;
}

std::shared_ptr<NamespaceNode> CommandSpec::GetParent() {
    return _parent.lock();
}

NamespaceNodeType CommandSpec::GetType() {
    return NodeTypeCommand;
}

void CommandSpec::SetDefaultOutputFormatter(std::string name) {
    _defaultFormat.SetFormatter(std::move(name));
}

void CommandSpec::SetDefaultOutputFormatter(const char* name) {
    _defaultFormat.SetFormatter(name);
}

void CommandSpec::SetDefaultOutputParameter(std::string key, std::string value) {
    _defaultFormat.SetParameter(std::move(key), std::move(value));
}

void CommandSpec::SetDefaultOutputParameter(const char* key, const char* value) {
    _defaultFormat.SetParameter(key, value);
}

void CommandSpec::AddExample(std::string syntax, std::string description) {
    _examples.emplace_back(std::move(syntax), std::move(description));
}

void CommandSpec::AddExample(const char* syntax, const char* description) {
    _examples.emplace_back(syntax, description);
}

void CommandSpec::AddMetaData(std::string name, std::string text) {
    _metaData.emplace_back(std::move(name), std::move(text));
}

bool CommandSpec::IsReadOnly() const {
    return GetMetaData("read-only") == "true";
}

void CommandSpec::SetValuesSource(const std::string& parameter, std::string source) {
    AddMetaData("values:" + parameter, std::move(source));
}

std::string CommandSpec::GetValuesSource(const std::string& parameter) const {
    return GetMetaData("values:" + parameter);
}

std::string CommandSpec::GetMetaData(const std::string& name) const {
    const auto found =
        std::ranges::find(_metaData, name, &std::pair<std::string, std::string>::first);
    return found == _metaData.end() ? "" : found->second;
}

}  // namespace AutoCli
