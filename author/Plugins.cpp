#include <author/Plugins.h>
#include <kelvash/Environment.h>

#include <CLI/CLI.hpp>

namespace Author {

void AddPluginOptions(CLI::App& verb, PluginOptions& options) {
    verb.add_option("--plugin", options.files, "Add the commands of this file")
        ->type_name("FILE")
        ->allow_extra_args(false);
    verb.add_option("--plugin-dir", options.folders, "Add the commands of all files of this folder")
        ->type_name("FOLDER")
        ->allow_extra_args(false);
}

void LoadPlugins(AutoCli::CliDispatcher& dispatcher, const PluginOptions& options) {
    SetUpFromEnvironment(dispatcher);
    for (const std::string& folder : options.folders) {
        dispatcher.AddExternalDirectory(folder);
    }
    for (const std::string& file : options.files) {
        const size_t count = dispatcher.GetPluginNames().size();
        try {
            dispatcher.AddPlugin(file);
        } catch (const Zelmar::ZelmarException& error) {
            throw std::runtime_error("Unable to load plugin " + file + ": " + error.what());
        }
        if (dispatcher.GetPluginNames().size() == count) {
            throw std::runtime_error("Unable to load plugin " + file +
                                     ": its name ends neither in .so nor in .xml");
        }
    }
}

}  // namespace Author
