// A descriptor file, from its bytes to nodes in a tree; its commands are asked for help and judge
// values, but are not run.

#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/Namespace.h>
#include <zelmar/autocli/extension/ExtensionCommand.h>
#include <zelmar/autocli/extension/XmlPlugin.h>
#include <zelmar/autocli/formatters/CommandHelpFormatter.h>

#include <sys/mman.h>
#include <unistd.h>

#include <cstdint>
#include <cstdlib>
#include <random>
#include <sstream>
#include <string>

#include "Silence.h"

namespace {

// A file that is only in memory, with the name that others know it by.
class MemoryFile {
public:
    MemoryFile(const std::uint8_t* data, std::size_t size) : _file(memfd_create("descriptor", 0)) {
        if (write(_file, data, size) != static_cast<ssize_t>(size)) {
            std::abort();
        }
    }
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;
    ~MemoryFile() { close(_file); }

    [[nodiscard]] std::string Path() const { return "/proc/self/fd/" + std::to_string(_file); }

private:
    int _file;
};

void AskForHelp(AutoCli::Command& command) {
    const auto input = CallSpec::Input::New();
    const auto output = CallSpec::Output::New();
    input->AddParameter("help", "true");
    command.Execute(input, output);
    AutoCli::FormatParameters parameters;
    AutoCli::DisplayContext context;
    std::ostringstream text;
    AutoCli::CommandHelpFormatter().Format(output, parameters, context, text);
}

// Words that mean something, and pieces of the descriptor.
std::string Value(std::string_view text, std::minstd_rand& random) {
    constexpr const char* words[] = {"", "0", "-7", "true", "off", "9223372036854775808", "\xff"};
    const size_t choice = random() % (2 * std::size(words));
    return choice < std::size(words)
               ? words[choice]
               : std::string(text.substr(random() % (text.size() + 1), random() % 20));
}

void Judge(AutoCli::ExtensionCommand& command, std::string_view text) {
    std::minstd_rand random(static_cast<unsigned>(text.size()));
    const auto spec = command.GetInputSpec();
    for (int call = 0; call < 8; ++call) {
        const auto input = CallSpec::Input::New();
        for (const auto& parameter : spec->GetParameterSpecs()) {
            for (auto count = random() % 3; count > 0; --count) {
                input->AddParameter(parameter->GetName(), Value(text, random));
            }
        }
        input->SetInputSpec(spec);
        if (spec->Validate(input, CallSpec::Output::New())) {
            (void)command.SubstituteInput(input, call % 2 == 0);
        }
    }
}

void Visit(AutoCli::NamespaceNode& node, std::string_view text) {
    if (auto* command = dynamic_cast<AutoCli::ExtensionCommand*>(&node)) {
        AskForHelp(*command);
        Judge(*command, text);
        return;
    }
    for (const auto& child : node.GetNamespaceNodes()) {
        Visit(*child, text);
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    SilenceXml();
    const MemoryFile file(data, size);
    const auto root = AutoCli::RootNamespace::New(nullptr);
    const auto plugin = AutoCli::XmlPlugin::New(file.Path());
    try {
        plugin->Initialize();
        plugin->RegisterNamespaces(root);
        Visit(*root, {reinterpret_cast<const char*>(data), size});
    } catch (const Zelmar::ZelmarException&) {
        // Nearly every input is wrong somewhere, and said to be.
    }
    return 0;
}
