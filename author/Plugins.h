#pragma once

#include <zelmar/zelmar.h>

#include <string>
#include <vector>

namespace CLI {
class App;
}

namespace Author {

struct PluginOptions {
    std::vector<std::string> files, folders;
};

/// The options `--plugin` and `--plugin-dir`, each with one value.
void AddPluginOptions(CLI::App& verb, PluginOptions& options);

/// Fills the tree as `kelvash` would, the folders of every call first; but a file that is named and
/// cannot be loaded throws `std::runtime_error`, for it is what the author came for.
void LoadPlugins(AutoCli::CliDispatcher& dispatcher, const PluginOptions& options);

}  // namespace Author
