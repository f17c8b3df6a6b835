// A host without argv: loads the plugin it is given, runs a command of it and prints the value.

#include <zelmar/zelmar.h>
#include <iostream>
#include <list>
#include <string>

int main(int argc, char** argv) {
    if (argc != 2) {
        return 2;
    }
    AutoCli::Dispatcher dispatcher;
    dispatcher.AddPlugin(argv[1]);

    std::list<std::string> path{"greeting", "get"};
    const auto input = AutoCli::CommandInput::New();
    const auto output = AutoCli::CommandOutput::New();
    input->SetCommandPath(path);
    input->AddParameter("from", "an installed plugin");
    if (!dispatcher.ExecuteCommand(input, output)) {
        for (const std::string& message : output->GetErrors()) {
            std::cerr << message << '\n';
        }
        return 1;
    }
    std::cout << *output->GetRootObject() << '\n';
}
