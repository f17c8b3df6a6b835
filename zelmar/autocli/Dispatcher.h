#pragma once

#include <zelmar/autocli/Command.h>
#include <zelmar/autocli/CommandInput.h>
#include <zelmar/autocli/CommandOutput.h>
#include <zelmar/autocli/Namespace.h>
#include <zelmar/autocli/Plugin.h>
#include <zelmar/autocli/formatters/Formatter.h>

#include <iosfwd>
#include <map>
#include <memory>
#include <string>
#include <vector>

namespace AutoCli {

/// The engine: owns the tree of commands and the plugins that fill it, runs one call at a time and
/// hands its output to a formatter. It knows nothing of command lines; `CliDispatcher` adds those.
/// Used from one thread at a time, with its tree and the objects of its calls; several dispatchers
/// can be used from a thread each, and finished values be read from any.
///
/// A new dispatcher has the built-in plugin and is ready to run. A call without a command line:
///
///     auto input = CommandInput::New();
///     auto output = CommandOutput::New();
///     input->SetCommandPath({"kelvash", "command", "list"});
///     if (dispatcher.ExecuteCommand(input, output)) { ... output->GetRootObject() ... }
///     else { ... output->GetErrors() ... }
class ZELMAR_EXPORT Dispatcher {
public:
    Dispatcher();
    Dispatcher(const Dispatcher&) = delete;
    Dispatcher& operator=(const Dispatcher&) = delete;
    /// The tree goes first, then the plugins.
    virtual ~Dispatcher();

    [[nodiscard]] std::shared_ptr<Namespace> GetRootNamespace() const { return _rootNamespace; }

    /// The command at the input's path, or null with messages on the output.
    std::shared_ptr<Command> GetCommand(std::shared_ptr<CommandInput> input,
                                        std::shared_ptr<CommandOutput> output);
    /// Runs one call: finds the command, checks the input, runs it, checks the output. True when
    /// the output ends without messages, those from before the call included. What a declaration
    /// throws passes through.
    bool ExecuteCommand(std::shared_ptr<CommandInput> input, std::shared_ptr<CommandOutput> output);

    /// What the addressed command asks for; empty when there is none, and then with messages on the
    /// output as from `GetCommand`.
    FormatParameters GetDefaultOutputFormatParameters(std::shared_ptr<CommandInput> input,
                                                      std::shared_ptr<CommandOutput> output);
    /// Prints the output through the formatter that the parameters name; prints nothing when they
    /// name none. The text reaches the stream's buffer in blocks. False, with the message "Unable
    /// to find requested formatter: <name>" on the output, when there is no such formatter. What
    /// the formatter throws passes through.
    bool FormatOutput(const std::shared_ptr<CallSpec::Output>& output, FormatParameters& parameters,
                      DisplayContext& context, std::ostream& stream);
    bool HasFormatter(const std::string& name);
    /// Null when there is none of that name.
    std::shared_ptr<Formatter> GetFormatter(const std::string& name);
    /// Ascending by name.
    std::vector<std::shared_ptr<Formatter>> GetFormatters();

    /// Takes an initialised plugin. Throws `ZelmarException` when the plugin fails to register its
    /// nodes or brings a formatter whose name is taken; nodes that it has registered by then stay.
    void RegisterPlugin(std::shared_ptr<Plugin> plugin);
    /// Loads one file, by its ending: `.so` or `.xml`. Any other file is ignored. Throws what
    /// loading throws; for a pipe, a socket or a device `ZelmarException`: "Unable to load plugin
    /// from <path> : not a regular file".
    void AddPlugin(const std::string& path);
    /// Loads all plugin files of a directory in the order of their names, those of its `lib64`
    /// first. A file that fails is reported on the error stream and skipped, and so is a directory
    /// that cannot be opened, unless it is the `lib64`. Where reading a directory fails half way,
    /// that is reported and what was found is loaded.
    void AddExternalDirectory(const std::string& directory);
    void AddExternalDirectoryInt(const std::string& directory, bool complain);
    /// Loads /usr/lib/norvane/kelvash and /usr/lib/norvane/kelvash/ext.
    void AddDefaultDirectories();
    /// In the order of registration; the first is "Internal".
    std::vector<std::string> GetPluginNames();
    /// Forgets the plugins. Their formatters and their commands stay, and stay usable.
    void ResetRegistrations();

protected:
    /// False, with the message that `FormatOutput` leaves, when there is no formatter of that name.
    bool RequireFormatter(const std::string& name, CallSpec::Output& output);

private:
    Plugin* PluginWithFormatter(const std::string& name);

    std::map<std::string, std::shared_ptr<Plugin>> _formatterPlugins;
    std::vector<std::shared_ptr<Plugin>> _plugins;
    std::shared_ptr<Namespace> _rootNamespace;
};

}  // namespace AutoCli
