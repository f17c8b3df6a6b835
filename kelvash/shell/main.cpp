// kelvash-shell: the commands of kelvash, one line after the other.

#include "Session.h"

#include "../Program.h"

#include <unistd.h>

#include <cerrno>
#include <clocale>
#include <csignal>
#include <cstdlib>
#include <iostream>
#include <string_view>

namespace {

constexpr const char* usage =
    R"(usage: kelvash-shell [--plugin <file>]... [--plugin-dir <folder>]...

Reads command lines as kelvash takes them and runs them, with Tab and ? for what
can follow. Where standard input or output is no terminal it reads them like
kelvash --input STDIN.
)";

// Such a signal ends the script that runs, in which it has its usual effect again, and not us.
void LeaveToScripts(int signal) {
    struct sigaction action = {};
    action.sa_handler = [](int) {
        const int error = errno;
        [[maybe_unused]] const ssize_t count = write(STDOUT_FILENO, "\n", 1);  // behind the "^C"
        errno = error;
    };
    sigaction(signal, &action, nullptr);
}

// Acts on the options of the shell; false when it cannot, which has been told.
bool HeedOptions(AutoCli::CliDispatcher& dispatcher, AutoCli::OptionParser& parser) {
    for (const auto& [name, value] : parser.GetDispatcherParameters()) {
        if (name != "plugin" && name != "plugin-dir" && name != "screen-width") {
            std::cerr << "kelvash-shell: there is no option " << name << "\n" << usage;
            return false;
        }
    }
    if (!parser.GetCommandPath().empty()) {
        std::cerr << "kelvash-shell: commands are typed when it runs\n" << usage;
        return false;
    }
    AutoCli::FormatParameters none;
    return dispatcher.HandleDispatcherOptions(parser, none, AutoCli::CommandOutput::New());
}

int Run(AutoCli::CliDispatcher& dispatcher, int argc, char** argv) {
    AutoCli::OptionParser parser;
    parser.ParseArgv(argc, argv);
    if (parser.HasDispatcherParameter("h") || parser.HasDispatcherParameter("help")) {
        std::cout << usage;
        return EXIT_SUCCESS;
    }
    if (!HeedOptions(dispatcher, parser)) {
        return EXIT_FAILURE;
    }
    if (isatty(STDIN_FILENO) == 0 || isatty(STDOUT_FILENO) == 0) {
        return dispatcher.ParseStreamInput(std::cin) ? EXIT_SUCCESS : EXIT_FAILURE;
    }
    // In the locale C, and in one that does not exist, Umlauts would be lost while they are typed.
    const char* locale = std::setlocale(LC_CTYPE, "");
    if (!locale || std::string_view(locale) == "C") {
        std::setlocale(LC_CTYPE, "C.UTF-8");
    }
    LeaveToScripts(SIGINT);
    LeaveToScripts(SIGQUIT);
    return KelvashShell::Session(dispatcher).Run();
}

}  // namespace

int main(int argc, char** argv) {
    return RunProgram(
        [=](AutoCli::CliDispatcher& dispatcher) { return Run(dispatcher, argc, argv); });
}
