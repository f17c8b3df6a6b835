// What a Tab costs beside a listing of the same tree: whole processes, from spawn to wait. And what
// it costs in a program that stays, as the interactive shell.

#include <zelmar/zelmar.h>

#include <filesystem>
#include <fstream>

#include "Paired.h"

namespace {

const std::filesystem::path folder = std::filesystem::temp_directory_path() / "zelmar-completion";
const std::string descriptor = folder / "commands.xml";

std::string Name(const char* prefix, int number) {
    return prefix + std::to_string(number);
}

// 100 namespaces of 100 commands each; one parameter can hold any of 5,000 values.
void WriteDescriptor() {
    std::ofstream file(descriptor);
    file << "<plugin><version>1.0.0</version><namespaces>";
    for (int group = 0; group < 100; ++group) {
        file << "<namespace path='" << Name("group", group)
             << "'><description>A group</description></namespace>";
    }
    file << "</namespaces><commands>";
    for (int command = 0; command < 10'000; ++command) {
        file << "<command path='" << Name("group", command / 100) << "."
             << Name("command", command % 100)
             << "'><description>A command</description><input-spec>"
                "<parameter name='value' type='string' required='true'>"
                "<description>A value</description>";
        if (command == 0) {
            file << "<constraint type='stringenum'><enum>";
            for (int value = 0; value < 5'000; ++value) {
                file << "<enum-value value='" << Name("value", value) << "'>A value</enum-value>";
            }
            file << "</enum></constraint>";
        }
        file << "</parameter></input-spec><output-spec><string/></output-spec><format-parameters>"
                "<formatter>simple</formatter></format-parameters><execute>true</execute>"
                "</command>\n";
    }
    file << "</commands></plugin>\n";
}

// The words as the tool reads them when a shell asks.
std::string Question(const std::string& name, const std::vector<std::string>& words) {
    std::string path = folder / name;
    std::ofstream file(path);
    for (const std::string& word : words) {
        file << word << '\0';
    }
    return path;
}

// A listing ends with 1, for no command has run.
Paired::Contender Listing(const std::vector<std::string>& words) {
    return {"kelvash lists it", [words] { Paired::RunProgram({.words = words, .status = 1}); },
            "at most 1.2"};
}

Paired::Contender Tab(const std::string& name, const std::string& question) {
    return {name, [question] {
                setenv("ZELMAR_COMPLETE", "zsh", 1);
                Paired::RunProgram({.words = {KELVASH}, .input = question});
                unsetenv("ZELMAR_COMPLETE");
            }};
}

}  // namespace

int main() {
    std::filesystem::create_directories(folder);
    WriteDescriptor();
    Paired::Compare("completion: a Tab behind kelvash, empty tree", 200,
                    {Tab("a Tab", Question("empty", {"kelvash", ""})), Listing({KELVASH})});
    const std::vector<std::string> call = {KELVASH, "--plugin", descriptor, "group0"};
    auto words = call;
    words.emplace_back();
    Paired::Compare("completion: in a tree of 10,000 commands", 31,
                    {Tab("a Tab for 100 commands", Question("names", words)), Listing(call)});
    words.insert(words.end() - 1, {"command0", "--value"});
    Paired::Compare("completion: in the same tree", 31,
                    {Tab("a Tab for 5,000 values", Question("values", words)), Listing(call)});

    AutoCli::Dispatcher dispatcher;
    dispatcher.AddPlugin(descriptor);
    const AutoCli::Completer completer(dispatcher);
    Paired::Compare("completion: in the same tree, in one process", 100,
                    {{"100 commands",
                      [&] {
                          Paired::Keep(completer.Complete({"group0", ""}));
                      }},
                     {"5,000 values", [&] {
                          Paired::Keep(completer.Complete({"group0", "command0", "--value", ""}));
                      }}});
    std::filesystem::remove_all(folder);
}
