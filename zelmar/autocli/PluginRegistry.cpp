// How a dispatcher comes by its plugins: one by one, by file, and by directory.

#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/Dispatcher.h>
#include <zelmar/autocli/SharedLibraryPlugin.h>
#include <zelmar/autocli/extension/XmlPlugin.h>

#include <dirent.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <iostream>
#include <string_view>
#include <system_error>

using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

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

// What is opened in order to be loaded must not wait for somebody to write, nor act on a device. A
// directory and a missing file are for the loader to tell of.
void RequireRegularFile(const std::string& path) {
    struct stat status = {};
    if (stat(path.c_str(), &status) == 0 && !S_ISREG(status.st_mode) && !S_ISDIR(status.st_mode)) {
        throw ZelmarException("Unable to load plugin from " + path + " : not a regular file");
    }
}

// Finds the paths of all entries but "." and "..", sorted. Where reading fails half way, the result
// is the error; otherwise it is 0.
int ListDirectory(DIR& directory, const std::string& path, std::vector<std::string>& paths) {
    errno = 0;
    while (const dirent* entry = readdir(&directory)) {
        const std::string_view name = entry->d_name;
        if (name != "." && name != "..") {
            paths.push_back(path + "/" + entry->d_name);
        }
        errno = 0;
    }
    const int error = errno;
    std::ranges::sort(paths);
    return error;
}

}  // namespace

void Dispatcher::RegisterPlugin(std::shared_ptr<Plugin> plugin) {
    const std::string& name = plugin->GetName();
    try {
        plugin->RegisterNamespaces(_rootNamespace);
    } catch (const ZelmarException& error) {
        throw ZelmarException("Error while trying to register the plugin " + name + " " +
                              error.what() + " The functionality in " + name +
                              " will not be available until this issue is resolved.");
    }
    const auto formatters = plugin->GetFormatters();
    for (const auto& formatter : formatters) {
        const auto holder = _formatterPlugins.find(formatter->GetName());
        if (holder != _formatterPlugins.end()) {
            throw ZelmarException("Error while trying to register the plugin " + name +
                                  "  this plugin has a formatter " + formatter->GetName() +
                                  " that was already registered from the plugin " +
                                  holder->second->GetName() + "  The functionality in " + name +
                                  " will not be available until this issue is resolved.");
        }
    }
    for (const auto& formatter : formatters) {
        _formatterPlugins[formatter->GetName()] = plugin;
    }
    _plugins.push_back(std::move(plugin));
}

void Dispatcher::AddPlugin(const std::string& path) {
    if (const auto plugin = PluginForFile(path)) {
        RequireRegularFile(path);
        plugin->Initialize();
        RegisterPlugin(plugin);
    }
}

void Dispatcher::AddExternalDirectoryInt(const std::string& directory, bool complain) {
    const std::unique_ptr<DIR, CloseDirectory> entries(opendir(directory.c_str()));
    if (!entries) {
        if (complain) {
            std::cerr << "Unable to open directory " << AutoCli_ErrorText(directory)
                      << " for plugin registration" << std::endl;
        }
        return;
    }
    std::vector<std::string> paths;
    if (const int error = ListDirectory(*entries, directory, paths)) {
        std::cerr << "Unable to read directory " << AutoCli_ErrorText(directory)
                  << " for plugin registration: " << std::generic_category().message(error)
                  << std::endl;
    }
    for (const std::string& path : paths) {
        try {
            AddPlugin(path);
        } catch (const ZelmarException& error) {
            std::cerr << AutoCli_ErrorText("Error loading plugin " + path +
                                           " skipping.  Error was: " + error.what())
                      << std::endl;
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
