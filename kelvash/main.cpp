#include <zelmar/zelmar.h>

#include <poll.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <iostream>
#include <optional>

namespace {

constexpr const char* defaultPluginDirectory = "/usr/lib/norvane/kelvash";

int ReportAndFail(const char* message) {
    std::cerr << "Errors: \n" << message << std::endl;
    return EXIT_FAILURE;
}

bool ReaderIsGone(int descriptor) {
    pollfd output = {descriptor, POLLOUT, 0};
    return poll(&output, 1, 0) == 1 && (output.revents & POLLERR) != 0;
}

// Runs at exit, where the last of the output leaves: what could not be written must not pass for a
// success. That a reader has seen enough is no news to anybody.
void CheckStandardOutput() {
    if (std::cout.flush().good() && std::fflush(stdout) == 0) {
        return;
    }
    if (!ReaderIsGone(STDOUT_FILENO)) {
        ReportAndFail("Unable to write to standard output");
    }
    _exit(EXIT_FAILURE);
}

}  // namespace

int main(int argc, char** argv) {
    std::atexit(&CheckStandardOutput);
    // Outlives the handlers: the code of what they catch may lie in a plugin that goes with it.
    std::optional<AutoCli::CliDispatcher> dispatcher;
    try {
        dispatcher.emplace();
        std::error_code noError;
        // A machine without any plugins is nothing to complain of on every call.
        if (std::filesystem::exists(defaultPluginDirectory, noError)) {
            dispatcher->AddDefaultDirectories();
        }
        AutoCli::AutoCli_AnswerCompletion(*dispatcher);
        dispatcher->HandleArgvInput(argc, argv);
    } catch (const std::exception& error) {
        return ReportAndFail(error.what());
    } catch (...) {
        return ReportAndFail("Unknown error");
    }
}
