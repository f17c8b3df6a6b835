#pragma once

#include <zelmar/autocli/Plugin.h>

#include <memory>
#include <string>
#include <vector>

namespace AutoCli {

/// A shared object that registers commands in code, or plugins with formatters. It exports the
/// function that `PluginEntry.h` declares.
///
/// The object stays loaded for as long as this plugin, and the root that was handed to it, live:
/// also when the registration fails half way, since nodes that hold its code may stay in the tree.
class ZELMAR_EXPORT SharedLibraryPlugin : public Plugin {
public:
    explicit SharedLibraryPlugin(const std::string& path) : _path(path) {}
    ~SharedLibraryPlugin() override;

    /// Loads nothing yet. The path is also the plugin's name.
    static std::shared_ptr<SharedLibraryPlugin> New(const std::string& path);

    /// Loads the object. Throws `ZelmarException`: "Unable to load plugin from <path> : <error>";
    /// "Unable to get plugin registration point from <path> : <error>".
    void Initialize() override;
    [[nodiscard]] const std::string& GetName() const override;
    /// Passes on what the object's function throws; what is no `ZelmarException` becomes one with
    /// the same text, or "Unknown error" where it has none.
    void RegisterNamespaces(std::shared_ptr<Namespace> root) override;
    bool HasFormatter(const std::string& name) override;
    std::shared_ptr<Formatter> GetFormatter(const std::string& name) override;
    const std::vector<std::shared_ptr<Formatter>>& GetFormatters() override;

private:
    const std::string _path;
    std::shared_ptr<void> _handle;  // the last owner unloads
    void (*_registerNamespaces)(std::shared_ptr<Namespace>) = nullptr;
};

}  // namespace AutoCli
