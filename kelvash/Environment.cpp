#include "Environment.h"

#include <cstdlib>
#include <filesystem>
#include <sstream>
#include <string>

namespace {

constexpr const char* defaultPluginDirectory = "/usr/lib/norvane/kelvash";

std::string Variable(const char* name) {
    const char* value = secure_getenv(name);
    return value ? value : "";
}

}  // namespace

void SetUpFromEnvironment(AutoCli::CliDispatcher& dispatcher) {
    std::error_code noError;
    // A machine without any plugins is nothing to complain of on every call.
    if (std::filesystem::exists(defaultPluginDirectory, noError)) {
        dispatcher.AddDefaultDirectories();
    }
    std::istringstream folders(Variable("KELVASH_PLUGIN_PATH"));
    for (std::string folder; std::getline(folders, folder, ':');) {
        if (!folder.empty()) {
            dispatcher.AddExternalDirectory(folder);
        }
    }
    dispatcher.SetDefaultFormatter(Variable("KELVASH_FORMATTER"));
}
