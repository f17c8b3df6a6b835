// One call without a command line: finding a command among 10,000, judging its five parameters,
// running it and judging what it gives. And where that time goes.

#include <zelmar/zelmar.h>

#include <charconv>
#include <unordered_map>

#include "Paired.h"

using AutoCli::CommandInput;
using AutoCli::CommandOutput;
using CallSpec::Input;
using CallSpec::InputSpec;
using CallSpec::Output;
using CallSpec::OutputSpec;
using CallSpec::ParameterConstraint;
using CallSpec::ParameterSpec;

namespace {

class Trivial : public AutoCli::Command {
public:
    std::shared_ptr<InputSpec> GetInputSpecInternal() override {
        auto spec = InputSpec::New();
        const auto size = ParameterSpec::New("size", CallSpec::ParameterTypeInt);
        const auto range = ParameterConstraint::New(CallSpec::ConstraintTypeIntRange);
        range->SetIntRange(1, 1'000'000);
        size->SetConstraint(range);
        const auto type = ParameterSpec::New("type", CallSpec::ParameterTypeString);
        const auto types = ParameterConstraint::New(CallSpec::ConstraintTypeStringEnum);
        types->AddStringEnum("ext4");
        types->AddStringEnum("xfs");
        type->SetConstraint(types);
        for (const auto& parameter :
             {ParameterSpec::New("device", CallSpec::ParameterTypeString), size, type,
              ParameterSpec::New("readonly", CallSpec::ParameterTypeBool),
              ParameterSpec::New("uid", CallSpec::ParameterTypeIntList)}) {
            spec->AddParameter(parameter);
        }
        return spec;
    }

    std::shared_ptr<OutputSpec> GetOutputSpecInternal() override {
        auto spec = OutputSpec::New();
        spec->SetRootObject(MetaObj::MetaInt::New());
        return spec;
    }

    void ExecuteInternal(const std::shared_ptr<Input>&,
                         const std::shared_ptr<Output>& output) override {
        output->SetRootObject(MetaObj::MetaInt::New());
    }
};

const std::list<std::string> path = {"group57", "command42"};

void FillTree(AutoCli::NamespaceNode& root) {
    for (int group = 0; group < 100; ++group) {
        const auto node = root.SubNamespace("group" + std::to_string(group));
        for (int command = 0; command < 100; ++command) {
            node->RegisterNamespaceNode(std::make_shared<Trivial>(),
                                        "command" + std::to_string(command));
        }
    }
}

std::shared_ptr<CommandInput> MakeInput() {
    auto input = CommandInput::New();
    std::list<std::string> words = path;
    input->SetCommandPath(words);
    input->AddParameter("device", "/dev/sda1");
    input->AddParameter("size", "4096");
    input->AddParameter("type", "ext4");
    input->AddParameter("readonly", "true");
    input->AddParameter("uid", "1000");
    return input;
}

void Require(bool truth) {
    if (!truth) {
        throw std::runtime_error("The call has failed");
    }
}

// The least that finds a function by a path and has read five values.
class Floor {
public:
    Floor() {
        for (int command = 0; command < 10'000; ++command) {
            _commands["group" + std::to_string(command / 100) + " command" +
                      std::to_string(command % 100)] = [](long size, bool readonly, long uid) {
                return size > 0 && readonly && uid > 0;
            };
        }
    }

    bool Call(const std::string& name, const std::map<std::string, std::string>& values) const {
        return _commands.at(name)(Number(values.at("size")), values.at("readonly") == "true",
                                  Number(values.at("uid"))) &&
               !values.at("device").empty() && values.at("type") == "ext4";
    }

private:
    static long Number(const std::string& text) {
        long number = 0;
        std::from_chars(text.data(), text.data() + text.size(), number);
        return number;
    }

    std::unordered_map<std::string, bool (*)(long, bool, long)> _commands;
};

}  // namespace

int main() {
    AutoCli::Dispatcher dispatcher;
    FillTree(*dispatcher.GetRootNamespace());
    const Floor floor;

    constexpr int calls = 10'000;
    const auto contender = [](const std::string& name, const std::function<void()>& work) {
        return Paired::Contender{name,
                                 [work] {
                                     for (int call = 0; call < calls; ++call) {
                                         work();
                                     }
                                 },
                                 "", calls};
    };
    const auto input = MakeInput();
    const auto output = CommandOutput::New();
    const auto command = dispatcher.GetCommand(input, output);
    Require(dispatcher.ExecuteCommand(input, output));

    Paired::Compare(
        "lookup: one call in a tree of 10,000 commands", 30,
        {contender("ExecuteCommand, call objects made anew",
                   [&] { Require(dispatcher.ExecuteCommand(MakeInput(), CommandOutput::New())); }),
         contender("a hash map of paths, five values in a map", [&] {
             Require(floor.Call("group57 command42", {{"device", "/dev/sda1"},
                                                      {"size", "4096"},
                                                      {"type", "ext4"},
                                                      {"readonly", "true"},
                                                      {"uid", "1000"}}));
         })});

    std::vector<std::string> errors;
    Paired::Compare(
        "lookup: where the time of a call goes", 30,
        {contender("ExecuteCommand", [&] { Require(dispatcher.ExecuteCommand(input, output)); }),
         contender("  of it GetCommand",
                   [&] { Require(dispatcher.GetCommand(input, output) != nullptr); }),
         contender("  of it SetInputSpec", [&] { input->SetInputSpec(command->GetInputSpec()); }),
         contender("  of it InputSpec::Validate",
                   [&] { Require(command->GetInputSpec()->Validate(input, output)); }),
         contender("  of it Execute, with its check of the output",
                   [&] { command->Execute(input, output); }),
         contender("  of that OutputSpec::Validate",
                   [&] { Require(command->GetOutputSpec()->Validate(output, &errors)); }),
         contender("beside it, making the call objects", [] {
             Paired::Keep(MakeInput());
             Paired::Keep(CommandOutput::New());
         })});
}
