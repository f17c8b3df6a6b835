#include <author/Verbs.h>
#include <author/schema/Schemas.h>

#include <CLI/CLI.hpp>

#include <iostream>

namespace Author {

namespace {

struct SchemaOptions {
    bool output = false;
};

int PrintSchema(const SchemaOptions& options) {
    std::cout << (options.output ? outputSchema : descriptorSchema);
    return EXIT_SUCCESS;
}

}  // namespace

void AddSchema(CLI::App& program, int& status) {
    auto options = std::make_shared<SchemaOptions>();
    CLI::App* verb = program.add_subcommand("schema", "Print the XML Schema of descriptors");
    verb->add_flag("--output", options->output, "Print that of what scripts print");
    verb->callback([options, &status] { status = PrintSchema(*options); });
}

}  // namespace Author
