// The tree of commands as tools for agents: a server of the Model Context Protocol over standard
// input and output.

#include <zelmar/zelmar.h>

#include <CLI/CLI.hpp>

#include <fcntl.h>
#include <unistd.h>

#include <filesystem>
#include <iostream>
#include <limits>

#include "Server.h"

namespace {

constexpr const char* defaultPluginDirectory = "/usr/lib/norvane/kelvash";

struct Options {
    std::vector<std::string> plugins, pluginDirectories;
    Policy policy;
    Limits limits;
    long timeLimit = Limits().time.count();
    bool printsTools = false;
};

void Declare(CLI::App& app, Options& options) {
    app.add_option("--plugin", options.plugins, "Add the commands of this file")->type_name("FILE");
    app.add_option("--plugin-dir", options.pluginDirectories,
                   "Add the commands of all files of this directory")
        ->type_name("DIRECTORY");
    app.add_option("--allow", options.policy.allow,
                   "Offer also the commands whose dotted path matches this shell pattern, such as"
                   " 'storage.*', and not only those that change nothing")
        ->type_name("PATTERN");
    app.add_option("--deny", options.policy.deny, "Never offer those that match this one")
        ->type_name("PATTERN");
    app.add_flag("--allow-secrets", options.policy.allowSecrets,
                 "Offer also commands that take a secret");
    app.add_option("--timeout", options.timeLimit, "Seconds that a call may take")
        ->check(CLI::Range(1L, 1'000'000L))
        ->capture_default_str();
    app.add_option("--max-result", options.limits.result, "Bytes that a result may have as JSON")
        ->check(CLI::Range(size_t{1}, std::numeric_limits<size_t>::max() / 4))
        ->capture_default_str();
    app.add_option("--parallel", options.limits.parallel, "Calls that may run at a time")
        ->check(CLI::Range(1, 64))
        ->capture_default_str();
    app.add_flag("--print-tools", options.printsTools,
                 "Print the tools with their schemas as JSON, and end");
    app.set_version_flag("--version", std::string("kelvash-mcp ") + Zelmar::GetVersion());
}

// Sets the standard descriptor free for what commands do with it: it leads to `target` from now on.
// Returns a descriptor of this process alone for what it led to.
int SetAside(int standard, int target) {
    const int own = fcntl(standard, F_DUPFD_CLOEXEC, STDERR_FILENO + 1);
    if (own < 0) {
        throw std::system_error(errno, std::generic_category(),
                                standard == STDIN_FILENO ? "standard input" : "standard output");
    }
    dup2(target, standard);
    return own;
}

void LoadPlugins(AutoCli::Dispatcher& dispatcher, const Options& options) {
    std::error_code noError;
    if (std::filesystem::exists(defaultPluginDirectory, noError)) {
        dispatcher.AddDefaultDirectories();
    }
    for (const std::string& directory : options.pluginDirectories) {
        dispatcher.AddExternalDirectory(directory);
    }
    for (const std::string& path : options.plugins) {
        try {
            dispatcher.AddPlugin(path);
        } catch (const Zelmar::ZelmarException& error) {
            std::cerr << "Unable to load plugin " << path << ": " << error.what() << std::endl;
        }
    }
}

int PrintTools(const Tools& tools, int output) {
    const Json document = {{"tools", tools.Describe("", std::numeric_limits<size_t>::max())}};
    LineWriter writer;
    writer.Add(document.dump(2, ' ', false, Json::error_handler_t::replace));
    while (writer.Size() > 0) {
        if (!writer.Write(output)) {
            throw std::system_error(errno, std::generic_category(),
                                    "Unable to write to standard output");
        }
    }
    return EXIT_SUCCESS;
}

int Run(const Options& options) {
    const int nothing = open("/dev/null", O_RDWR | O_CLOEXEC);
    const int input = SetAside(STDIN_FILENO, nothing);
    const int output = SetAside(STDOUT_FILENO, STDERR_FILENO);
    AutoCli::Dispatcher dispatcher;
    LoadPlugins(dispatcher, options);
    const Tools tools(dispatcher, options.policy);
    return options.printsTools ? PrintTools(tools, output)
                               : Server(dispatcher, tools, options.limits, input, output).Run();
}

}  // namespace

int main(int argc, char** argv) {
    CLI::App app(
        "Offers the commands of kelvash to agents, as a server of the Model Context"
        " Protocol over standard input and output.",
        "kelvash-mcp");
    Options options;
    Declare(app, options);
    CLI11_PARSE(app, argc, argv);
    options.limits.time = std::chrono::seconds(options.timeLimit);
    try {
        return Run(options);
    } catch (const std::exception& error) {
        std::cerr << "kelvash-mcp: " << error.what() << std::endl;
        return EXIT_FAILURE;
    }
}
