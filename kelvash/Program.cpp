#include "Program.h"

#include "Environment.h"
#include "StandardStreams.h"

#include <malloc.h>

#include <csignal>
#include <cstdlib>
#include <iostream>
#include <optional>

namespace {

int ReportAndFail(const char* message) {
    std::cerr << "Errors: \n" << AutoCli::AutoCli_ErrorText(message) << std::endl;
    return EXIT_FAILURE;
}

}  // namespace

int RunProgram(const std::function<int(AutoCli::CliDispatcher&)>& run) {
    FillClosedStreams();
    CheckStandardOutputAtExit();
    // A caller that ignores the end of its children passes that on; a command waits for its own.
    std::signal(SIGCHLD, SIG_DFL);
    // Values are many small pieces that go at one time. Kept apart in the fast bins of the C
    // library, they would be joined again later, at a multiple of what it costs as they go.
    mallopt(M_MXFAST, 0);
    // Outlives the handlers: the code of what they catch may lie in a plugin that goes with it.
    std::optional<AutoCli::CliDispatcher> dispatcher;
    try {
        dispatcher.emplace();
        SetUpFromEnvironment(*dispatcher);
        std::exit(run(*dispatcher));  // without taking the tree down first
    } catch (const std::exception& error) {
        return ReportAndFail(error.what());
    } catch (...) {
        return ReportAndFail("Unknown error");
    }
}
