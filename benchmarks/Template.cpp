// Expanding the template of a command line.

#include <zelmar/autocli/extension/ExtensionCommand.h>

#include "Memory.h"
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

// A script of 50 MB as a value, beside what the line that comes out of it takes.
void PrintMemoryOfLargeValue() {
    std::string value;
    while (value.size() < 50'000'000) {
        value += "if [ -n \"${name}\" ]; then { echo $name; }; fi\n";
    }
    Call call = MakeCall(1);
    call.command->SetStdin("$val{parameter-0} $if{parameter-1,x}");
    call.input = CallSpec::Input::New();
    call.input->AddParameter("parameter-0", value);
    call.input->SetInputSpec(call.command->GetInputSpec());
    size_t size = 0;
    const long growth =
        Memory::GrowthWhile([&] { size = call.command->SubstituteInput(call.input, true).size(); });
    std::printf("memory for a value of 50 MB, by the byte of the text%34.2f  at most 4\n\n",
                1024.0 * static_cast<double>(growth) / static_cast<double>(size));
}

}  // namespace

int main() {
    PrintMemoryOfLargeValue();
    Paired::Compare("expanding a template of 40 forms, by the KB", 31,
                    {{.name = "of 10 KB", .run = Expanding(1000), .times = calls * 10},
                     {"of 100 KB", Expanding(10000), "constant", calls * 100},
                     {"of 1 MB", Expanding(100000), "constant", calls * 1000}});
    Paired::Compare("expanding a template of 40 forms", 31,
                    {{.name = "SubstituteInput", .run = Expanding(1), .times = calls}});
}
