// How a dispatcher comes by its plugins: one by one, by file, and by directory.

#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/Dispatcher.h>
#include <zelmar/autocli/SharedLibraryPlugin.h>
#include <zelmar/autocli/extension/XmlPlugin.h>

#include <dirent.h>

#include <algorithm>
#include <iostream>
#include <string_view>

using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

std::string UnavailableUntilResolved(const Plugin& plugin) {
    return " The functionality in " + plugin.GetName() +
           " will not be available until this issue is resolved.";
}

bool HasEnding(std::string_view path, std::string_view ending) {
    return path.size() > ending.size() && path.ends_with(ending);
}

// Null for a file that is no plugin.
std::shared_ptr<Plugin> PluginForFile(const std::string& path) {
    if (HasEnding(path, ".so")) {
        return SharedLibraryPlugin::New(path);
    }
    if (HasEnding(path, ".xml")) {
        return XmlPlugin::New(path);
    }
    return nullptr;
}

struct CloseDirectory {
    void operator()(DIR* directory) const { closedir(directory); }
};

// The paths of all entries but "." and "..", sorted. False when the directory cannot be read.
bool ListDirectory(const std::string& directory, std::vector<std::string>& paths) {
    const std::unique_ptr<DIR, CloseDirectory> entries(opendir(directory.c_str()));
    if (!entries) {
        return false;
    }
    while (const dirent* entry = readdir(entries.get())) {
        const std::string_view name = entry->d_name;
        if (name != "." && name != "..") {
            paths.push_back(directory + "/" + entry->d_name);
        }
    }
    std::ranges::sort(paths);
    return true;
}

}  // namespace

void Dispatcher::RegisterPlugin(std::shared_ptr<Plugin> plugin) {
    try {
        plugin->RegisterNamespaces(_rootNamespace);
    } catch (const ZelmarException& error) {
        throw ZelmarException("Error while trying to register the plugin " + plugin->GetName() +
                              " " + error.what() + UnavailableUntilResolved(*plugin));
    }
    RequireFormatterNamesFree(*plugin);
    for (const auto& formatter : plugin->GetFormatters()) {
        _formatterPlugins[formatter->GetName()] = plugin;
    }
    _plugins.push_back(std::move(plugin));
}

void Dispatcher::RequireFormatterNamesFree(Plugin& plugin) {
    for (const auto& formatter : plugin.GetFormatters()) {
        const auto holder = _formatterPlugins.find(formatter->GetName());
        if (holder != _formatterPlugins.end()) {
            throw ZelmarException("Error while trying to register the plugin " + plugin.GetName() +
                                  "  this plugin has a formatter " + formatter->GetName() +
                                  " that was already registered from the plugin " +
                                  holder->second->GetName() + " " +
                                  UnavailableUntilResolved(plugin));
        }
    }
}

void Dispatcher::AddPlugin(const std::string& path) {
    if (const auto plugin = PluginForFile(path)) {
        plugin->Initialize();
        RegisterPlugin(plugin);
    }
}

void Dispatcher::AddExternalDirectoryInt(const std::string& directory, bool complain) {
    std::vector<std::string> paths;
    if (!ListDirectory(directory, paths)) {
        if (complain) {
            std::cerr << "Unable to open directory " << directory << " for plugin registration"
                      << std::endl;
        }
        return;
    }
    for (const std::string& path : paths) {
        try {
            AddPlugin(path);
        } catch (const ZelmarException& error) {
            std::cerr << "Error loading plugin " << path
                      << " skipping.  Error was: " << error.what() << std::endl;
        }
    }
}

void Dispatcher::AddExternalDirectory(const std::string& directory) {
    AddExternalDirectoryInt(directory + "/lib64", false);
    AddExternalDirectoryInt(directory, true);
}

void Dispatcher::AddDefaultDirectories() {
    AddExternalDirectory("/usr/lib/norvane/kelvash");
    AddExternalDirectory("/usr/lib/norvane/kelvash/ext");
}

}  // namespace AutoCli
