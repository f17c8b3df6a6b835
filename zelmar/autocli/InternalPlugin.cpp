#include <zelmar/autocli/CommandList.h>
#include <zelmar/autocli/InternalPlugin.h>
#include <zelmar/autocli/formatters/CommandHelpFormatter.h>
#include <zelmar/autocli/formatters/JsonFormatter.h>
#include <zelmar/autocli/formatters/PythonFormatter.h>
#include <zelmar/autocli/formatters/SimpleFormatter.h>
#include <zelmar/autocli/formatters/TableFormatter.h>
#include <zelmar/autocli/formatters/XmlFormatter.h>

#include <algorithm>

namespace AutoCli {

InternalPlugin::~InternalPlugin() = default;

std::shared_ptr<InternalPlugin> InternalPlugin::New() {
    return std::make_shared<InternalPlugin>();
}

void InternalPlugin::Initialize() {
    _formatters.push_back(std::make_shared<TableFormatter>());
    _formatters.push_back(std::make_shared<SimpleFormatter>());
    _formatters.push_back(std::make_shared<XmlFormatter>());
    _formatters.push_back(std::make_shared<PythonFormatter>());
    _formatters.push_back(std::make_shared<JsonFormatter>());
    _formatters.push_back(std::make_shared<CommandHelpFormatter>());
}

const std::string& InternalPlugin::GetName() const {
    static const std::string name = "Internal";
    return name;
}

void InternalPlugin::RegisterNamespaces(std::shared_ptr<Namespace> root) {
    const auto outer = Namespace::New();
    outer->SetDescription(
        "Commands that operate on the kelvash system itself allowing users to get additional"
        " information.");
    const auto inner = Namespace::New();
    inner->SetDescription("Operations to get information about commands.");
    // From the bottom up: the tree takes the finished part or nothing.
    inner->RegisterNamespaceNode(CommandList::New(root), "list");
    outer->RegisterNamespaceNode(inner, "command");
    root->RegisterNamespaceNode(outer, "kelvash");
}

bool InternalPlugin::HasFormatter(const std::string& name) {
    return GetFormatter(name) != nullptr;
}

std::shared_ptr<Formatter> InternalPlugin::GetFormatter(const std::string& name) {
    const auto found = std::ranges::find(_formatters, name, &Formatter::GetName);
    return found == _formatters.end() ? nullptr : *found;
}

const std::vector<std::shared_ptr<Formatter>>& InternalPlugin::GetFormatters() {
    return _formatters;
}

}  // namespace AutoCli
