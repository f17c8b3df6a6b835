#include <author/Files.h>
#include <author/test/Guarded.h>
#include <author/test/Probe.h>
#include <author/test/ProbeCalls.h>

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iostream>

namespace Author {

namespace {

namespace fs = std::filesystem;

using Commands = std::vector<std::shared_ptr<AutoCli::Command>>;

void Collect(const std::shared_ptr<AutoCli::NamespaceNode>& node, Commands& commands) {
    if (const auto command = std::dynamic_pointer_cast<AutoCli::Command>(node)) {
        commands.push_back(command);
        return;
    }
    for (const auto& child : node->GetNamespaceNodes()) {
        Collect(child, commands);
    }
}

// A value as it can be typed, if it is short.
std::string Shown(const std::string& value) {
    if (value.size() > 100) {
        return "'" + value.substr(0, 1) + "...' (" + std::to_string(value.size()) + " bytes)";
    }
    std::string text;
    for (const char character : value) {
        constexpr std::string_view digits = "0123456789abcdef";
        const auto byte = static_cast<unsigned char>(character);
        if (byte < ' ' || byte > '~' || character == '\'') {
            text += {'\\', 'x', digits[byte / 16], digits[byte % 16]};
        } else {
            text += character;
        }
    }
    return "'" + text + "'";
}

std::string Shown(const ProbeCall& call) {
    std::string text = call.environment == ProbeCall::Environment::NoLang ? " without LANG"
                       : call.environment == ProbeCall::Environment::Empty
                           ? " with an empty environment"
                           : "";
    for (const auto& [name, value] : call.parameters) {
        text += " --" + name + (value.empty() ? "" : " " + Shown(value));
    }
    return text;
}

int Call(AutoCli::Dispatcher& dispatcher, AutoCli::Command& command, const ProbeCall& call,
         std::vector<std::string> environment) {
    const int streams = open("../printed", O_WRONLY | O_CREAT | O_CLOEXEC, 0600);
    dup2(streams, STDOUT_FILENO);
    dup2(streams, STDERR_FILENO);
    if (call.environment == ProbeCall::Environment::NoLang) {
        unsetenv("LANG");
    } else if (call.environment == ProbeCall::Environment::Empty) {
        clearenv();
    }
    for (std::string& variable : environment) {
        putenv(variable.data());
    }
    const auto input = AutoCli::CommandInput::New();
    const auto output = AutoCli::CommandOutput::New();
    input->SetCommandPath(command.GetPath());
    for (const auto& [name, value] : call.parameters) {
        input->AddParameter(name, value);
    }
    dispatcher.ExecuteCommand(input, output);
    std::ofstream errors("../errors");
    for (const std::string& error : output->GetErrors()) {
        errors << error << '\n';
    }
    return EXIT_SUCCESS;
}

// Words of the engine for what is not the fault of the call.
bool IsBroken(const std::string& errors) {
    return std::ranges::any_of(
        std::initializer_list<const char*>{"Implementation error!", "Got no data from process.",
                                           "Unable to parse output of Extension Command",
                                           "Error on command ", "Unable to write to sub-process"},
        [&](const char* text) { return errors.find(text) != std::string::npos; });
}

// What is wrong with what came of a call; empty for nothing.
std::string Verdict(const ProbeCall& call, const std::string& folder) {
    if (fs::exists(folder + "/work/" + canary)) {
        return "a value ran as a command of the shell";
    }
    if (!fs::exists(folder + "/errors")) {
        return "the process of the call crashed";
    }
    const std::string errors = ReadFile(folder + "/errors");
    if (call.isIncomplete && errors.empty()) {
        return "it runs without a required parameter";
    }
    if (!IsBroken(errors)) {
        return "";
    }
    std::string cause;
    std::getline(std::ifstream(folder + "/printed"), cause);
    std::string text = errors + cause;
    text.resize(std::min(text.size(), size_t{1000}));
    return "it breaks:\n" + text.substr(0, text.find_last_not_of('\n') + 1);
}

class Prober {
public:
    explicit Prober(const ProbeOptions& options) : _options(options) {
        Commands own;
        Collect(_dispatcher.GetRootNamespace(), own);
        for (const std::string& plugin : options.plugins) {
            _dispatcher.AddPlugin(plugin);
        }
        Collect(_dispatcher.GetRootNamespace(), _commands);
        std::erase_if(_commands, [&](const auto& command) {
            return std::ranges::find(own, command) != own.end();
        });
    }

    bool Run() {
        for (const auto& command : _commands) {
            std::string unknown;
            if (!_options.mayChange && !command->IsReadOnly()) {
                LeaveOut(*command, "it may change something, which --yes allows");
            } else if (const auto calls = ProbeCallsOf(*command, unknown)) {
                RunCalls(*command, *calls);
            } else {
                LeaveOut(*command, "no value was found that --" + unknown + " takes");
            }
        }
        std::cout << "Commands: " << _commands.size() << ", calls: " << _calls
                  << ", calls that are wrong: " << _wrong << '\n';
        if (!_leftOut.empty()) {
            throw Unreadable(_leftOut);
        }
        return _wrong == 0;
    }

private:
    void LeaveOut(AutoCli::Command& command, const std::string& reason) {
        _leftOut += (_leftOut.empty() ? "" : "\nzelmar: ") + command.GetPathString(' ') +
                    " was left out: " + reason;
    }

    // What hangs, or breaks when it is given next to nothing, is not called again.
    void RunCalls(AutoCli::Command& command, const std::vector<ProbeCall>& calls) {
        bool goesOn = true;
        for (size_t i = 0; i < calls.size() && goesOn; ++i) {
            const TemporaryFolder folder;
            const std::string work = folder.GetPath() + "/work";
            fs::create_directory(work);
            const bool hasEnded = RunGuarded(work, _options.limit, [&] {
                return Call(_dispatcher, command, calls[i], _options.environment);
            });
            const std::string verdict =
                hasEnded ? Verdict(calls[i], folder.GetPath()) : "it does not end in time";
            goesOn = hasEnded && (i > 0 || verdict.empty());
            ++_calls;
            if (!verdict.empty()) {
                ++_wrong;
                std::cout << command.GetPathString(' ') << Shown(calls[i]) << ": " << verdict
                          << '\n';
            }
        }
    }

    const ProbeOptions& _options;
    AutoCli::Dispatcher _dispatcher;
    Commands _commands;
    std::string _leftOut;
    size_t _calls = 0;
    size_t _wrong = 0;
};

}  // namespace

bool Probe(const ProbeOptions& options) {
    return Prober(options).Run();
}

}  // namespace Author
