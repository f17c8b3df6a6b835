#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/Dispatcher.h>
#include <zelmar/autocli/InternalPlugin.h>
#include <zelmar/autocli/formatters/BlockOutput.h>
#include <zelmar/internal/platform/Flagset.h>

using Zelmar::ZelmarException;

namespace AutoCli {

Dispatcher::Dispatcher() {
    Flagset_InitDeltaMode();
    const auto internal = InternalPlugin::New();
    _rootNamespace = RootNamespace::New(this);
    internal->Initialize();
    RegisterPlugin(internal);
}

// A plugin with formatters may stand in the shared object of another, which the tree and that other
// plugin keep loaded: so the formatters go ahead of both.
Dispatcher::~Dispatcher() {
    _formatterPlugins.clear();
    _rootNamespace.reset();
    _plugins.clear();
}

std::shared_ptr<Command> Dispatcher::GetCommand(std::shared_ptr<CommandInput> input,
                                                std::shared_ptr<CommandOutput> output) {
    std::list<std::string> path = input->GetCommandPath();
    std::shared_ptr<NamespaceNode> node;
    try {
        node = _rootNamespace->ResolveNode(path);
    } catch (const ZelmarException& error) {
        output->AddErrorMessage(error.what());
    }
    if (!node) {
        output->AddErrorMessage("Unable to find command");
        return nullptr;
    }
    if (node->GetType() != NodeTypeCommand) {
        output->AddErrorMessage("Path refers to a namespace, not a command.");
        return nullptr;
    }
    return std::dynamic_pointer_cast<Command>(node);
}

bool Dispatcher::ExecuteCommand(std::shared_ptr<CommandInput> input,
                                std::shared_ptr<CommandOutput> output) {
    const auto command = GetCommand(input, output);
    if (!command) {
        return false;
    }
    const auto spec = command->GetInputSpec();
    input->SetInputSpec(spec);
    if (spec->Validate(input, output)) {
        command->Execute(input, output);
    } else if (!output->HasError() && !output->GetRootObject()) {
        output->AddErrorMessage(
            "Command output has no root object nor error messages.  This is a problem with the"
            " command and should be repaired.");
    }
    return !output->HasError();
}

FormatParameters Dispatcher::GetDefaultOutputFormatParameters(
    std::shared_ptr<CommandInput> input, std::shared_ptr<CommandOutput> output) {
    const auto command = GetCommand(input, output);
    return command ? command->GetDefaultOutputFormatParameters() : FormatParameters();
}

bool Dispatcher::FormatOutput(const std::shared_ptr<CallSpec::Output>& output,
                              FormatParameters& parameters, DisplayContext& context,
                              std::ostream& stream) {
    const std::string& name = parameters.GetFormatter();
    if (name.empty()) {
        return true;
    }
    if (!RequireFormatter(name, *output)) {
        return false;
    }
    BlockOutput blocks(stream);
    GetFormatter(name)->Format(output, parameters, context, blocks);
    stream.flags(blocks.flags());
    return true;
}

bool Dispatcher::RequireFormatter(const std::string& name, CallSpec::Output& output) {
    const bool found = GetFormatter(name) != nullptr;
    if (!found) {
        output.AddErrorMessage("Unable to find requested formatter: " + name);
    }
    return found;
}

Plugin* Dispatcher::PluginWithFormatter(const std::string& name) {
    const auto plugin = _formatterPlugins.find(name);
    const bool found =
        plugin != _formatterPlugins.end() && plugin->second && plugin->second->HasFormatter(name);
    return found ? plugin->second.get() : nullptr;
}

bool Dispatcher::HasFormatter(const std::string& name) {
    return PluginWithFormatter(name) != nullptr;
}

std::shared_ptr<Formatter> Dispatcher::GetFormatter(const std::string& name) {
    Plugin* plugin = PluginWithFormatter(name);
    return plugin ? plugin->GetFormatter(name) : nullptr;
}

std::vector<std::shared_ptr<Formatter>> Dispatcher::GetFormatters() {
    std::vector<std::shared_ptr<Formatter>> formatters;
    for (const auto& [name, plugin] : _formatterPlugins) {
        formatters.push_back(plugin->GetFormatter(name));
    }
    return formatters;
}

std::vector<std::string> Dispatcher::GetPluginNames() {
    std::vector<std::string> names;
    for (const auto& plugin : _plugins) {
        names.push_back(plugin->GetName());
    }
    return names;
}

void Dispatcher::ResetRegistrations() {
    _plugins.clear();
}

}  // namespace AutoCli
