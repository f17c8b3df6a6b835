#include <author/Plugins.h>
#include <author/Verbs.h>
#include <author/doc/Pages.h>

#include <CLI/CLI.hpp>

#include <cstdlib>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <stdexcept>

namespace Author {

namespace {

struct DocOptions {
    PluginOptions plugins;
    bool asMarkdown = false;
    bool asJson = false;
    std::string manualFolder;
    std::vector<std::string> path;
};

// That of the pages: today, or what the builder of a package has set for all its files
// (https://reproducible-builds.org/specs/source-date-epoch/).
std::string Date() {
    const char* epoch = std::getenv("SOURCE_DATE_EPOCH");
    const std::time_t time = epoch ? std::strtol(epoch, nullptr, 10) : std::time(nullptr);
    std::tm parts{};
    gmtime_r(&time, &parts);
    char text[64];
    return {text, std::strftime(text, sizeof text, "%Y-%m-%d", &parts)};
}

// Another one of that name stays as it is until the new one is whole.
void WriteFile(const std::filesystem::path& path, const std::string& text) {
    const std::filesystem::path unfinished = path.string() + ".new";
    std::ofstream file(unfinished, std::ios::binary);
    if (!(file << text).flush()) {
        std::error_code noError;
        std::filesystem::remove(unfinished, noError);
        throw std::runtime_error("Unable to write " + path.string());
    }
    file.close();
    std::filesystem::rename(unfinished, path);
}

void WriteManual(const Json& reference, const std::filesystem::path& folder) {
    std::filesystem::create_directories(folder);
    const std::string date = Date();
    for (const Json& command : reference["commands"]) {
        WriteFile(folder / (ManualName(command) + ".1"), AsManualPage(command, date));
    }
}

int RunDoc(const DocOptions& options) {
    AutoCli::CliDispatcher dispatcher;
    LoadPlugins(dispatcher, options.plugins);
    std::list<std::string> path(options.path.begin(), options.path.end());
    std::shared_ptr<AutoCli::NamespaceNode> node = dispatcher.GetRootNamespace();
    node = path.empty() ? node : node->ResolveNode(path);
    int status = EXIT_SUCCESS;
    const Json reference = MakeReference(*node, [&status](const std::string& reason) {
        std::cerr << "zelmar: left out " << reason << '\n';
        status = EXIT_FAILURE;
    });
    if (!options.manualFolder.empty()) {
        WriteManual(reference, options.manualFolder);
    } else {
        std::cout << (options.asJson ? reference.dump(2) + "\n" : AsMarkdown(reference));
    }
    return status;
}

}  // namespace

void AddDoc(CLI::App& program, int& status) {
    auto options = std::make_shared<DocOptions>();
    CLI::App* verb = program.add_subcommand(
        "doc", "Write the reference of all commands, or of those below a namespace.");
    AddPluginOptions(*verb, options->plugins);
    auto* markdown = verb->add_flag("--markdown", options->asMarkdown,
                                    "Print a page for a wiki; so it is without an option");
    auto* manual = verb->add_option("--man", options->manualFolder,
                                    "Write a manual page for each command into this folder")
                       ->type_name("FOLDER");
    auto* json = verb->add_flag("--json", options->asJson,
                                "Print a document for programs, as doc.schema.json tells");
    markdown->excludes(manual, json);
    manual->excludes(json);
    verb->add_option("PATH", options->path, "The words of a namespace or command");
    verb->callback([options, &status] { status = RunDoc(*options); });
}

}  // namespace Author
