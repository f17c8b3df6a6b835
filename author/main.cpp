#include <author/Verbs.h>
#include <zelmar/Version.h>

#include <CLI/CLI.hpp>

#include <cstdio>
#include <iostream>

namespace {

constexpr int notRunnable = 2;

int Fail(const char* message) {
    std::cerr << "zelmar: " << message << '\n';
    return notRunnable;
}

int Run(int argc, char** argv) {
    CLI::App program("Helps to write commands: descriptors and the scripts they run.", "zelmar");
    program.set_version_flag("--version", "zelmar " ZELMAR_VERSION);
    program.require_subcommand(1);
    int status = EXIT_SUCCESS;
    Author::AddDoc(program, status);
    Author::AddLint(program, status);
    Author::AddNew(program, status);
    Author::AddSchema(program, status);
    Author::AddTest(program, status);
    Author::AddTry(program, status);
    try {
        program.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        return program.exit(error) == EXIT_SUCCESS ? EXIT_SUCCESS : notRunnable;
    }
    return status;
}

}  // namespace

int main(int argc, char** argv) {
    try {
        const int status = Run(argc, argv);
        if (!std::cout.flush()) {
            return Fail("Unable to write to standard output");
        }
        return status;
    } catch (const std::exception& error) {
        return Fail(error.what());
    }
}
