#include <author/Verbs.h>
#include <zelmar/zelmar.h>

#include <CLI/CLI.hpp>

#include <iostream>

namespace Author {

namespace {

struct LintOptions {
    std::vector<std::string> files;
};

int Lint(const LintOptions& options) {
    int status = EXIT_SUCCESS;
    for (const std::string& file : options.files) {
        try {
            AutoCli::XmlPlugin::New(file)->Initialize();
        } catch (const Zelmar::ZelmarException& error) {
            std::cout << file << ":1: error: " << error.what() << " [load]\n";
            status = EXIT_FAILURE;
        }
    }
    return status;
}

}  // namespace

void AddLint(CLI::App& program, int& status) {
    auto options = std::make_shared<LintOptions>();
    CLI::App* verb = program.add_subcommand("lint", "Find what is wrong with descriptors");
    verb->add_option("FILE", options->files, "Descriptors")->required();
    verb->callback([options, &status] { status = Lint(*options); });
}

}  // namespace Author
