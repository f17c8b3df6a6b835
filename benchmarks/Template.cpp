// Expanding the template of a command line.

#include <zelmar/autocli/extension/ExtensionCommand.h>

#include "Paired.h"

using CallSpec::ParameterSpec;

namespace {

constexpr int forms = 40;
constexpr int calls = 200;

struct Call {
    std::shared_ptr<AutoCli::ExtensionCommand> command = AutoCli::ExtensionCommand::New();
    std::shared_ptr<CallSpec::Input> input = CallSpec::Input::New();
};

// Ten parameters in four forms each, half of them given, each behind so many blanks.
Call MakeCall(size_t blanks) {
    Call call;
    const auto spec = CallSpec::InputSpec::New();
    std::string text = "tool";
    for (int i = 0; i < forms / 4; ++i) {
        const std::string name = "parameter-" + std::to_string(i);
        spec->AddParameter(ParameterSpec::New(name, CallSpec::ParameterTypeString));
        text += std::string(blanks, ' ') + "$if{" + name + ",--" + name + " '$val{" + name + "}'}" +
                "$if{" + name + ",$list{" + name + ",',',true}}";
        if (i % 2 == 0) {
            call.input->AddParameter(name, "some value");
        }
    }
    call.command->SetInputSpec(spec);
    call.command->SetExecuteCommand(text);
    call.input->SetInputSpec(spec);
    return call;
}

std::function<void()> Expanding(size_t blanks) {
    return [call = MakeCall(blanks)] {
        for (int i = 0; i < calls; ++i) {
            Paired::Keep(call.command->SubstituteInput(call.input, false));
        }
    };
}

}  // namespace

int main() {
    Paired::Compare("expanding a template of 40 forms, by the KB", 31,
                    {{.name = "of 10 KB", .run = Expanding(1000), .times = calls * 10},
                     {"of 100 KB", Expanding(10000), "constant", calls * 100},
                     {"of 1 MB", Expanding(100000), "constant", calls * 1000}});
    Paired::Compare("expanding a template of 40 forms", 31,
                    {{.name = "SubstituteInput", .run = Expanding(1), .times = calls}});
}
