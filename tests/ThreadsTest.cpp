// Dispatchers of two threads have nothing in common: the thread sanitizer watches while each calls
// commands of its own, with and without a process, and prints.

#include <zelmar/zelmar.h>

#include <cstdlib>
#include <iostream>
#include <string>
#include <thread>

namespace {

bool Run(const std::string& line) {
    AutoCli::CliDispatcher dispatcher;
    AutoCli::OptionParser parser;
    parser.ParseString(line);
    return dispatcher.Run(parser, false) == EXIT_SUCCESS;
}

void Call(const std::string& options, int& failures) {
    for (int i = 0; i < 10; ++i) {
        for (const char* command : {" kelvash command list", " digest text get --secret x",
                                    " digest text get --algorithm md5 --help"}) {
            failures += Run(options + command) ? 0 : 1;
        }
    }
}

}  // namespace

// The descriptor of `digest text get` is the one argument.
int main(int /*argc*/, char** argv) {
    int failures[2] = {};
    const std::string plugin = std::string(" --plugin ") + argv[1];
    std::thread other([&] { Call("--screen-width 40 --formatter json" + plugin, failures[0]); });
    Call("--screen-width 80 --format-param align-fields=true" + plugin, failures[1]);
    other.join();
    return failures[0] + failures[1];
}
