// A template and the values for it. Each line of the input is one value, the first is the template.

#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/ExtensionCommand.h>

#include <cstdint>
#include <cstdlib>
#include <sstream>

using CallSpec::InputSpec;
using CallSpec::ParameterSpec;

namespace {

std::shared_ptr<InputSpec> Declaration() {
    auto spec = InputSpec::New();
    spec->AddParameter(ParameterSpec::New("aa", CallSpec::ParameterTypeString));
    spec->AddParameter(ParameterSpec::New("bb", CallSpec::ParameterTypeStringList));
    spec->AddParameter(ParameterSpec::New("cc", CallSpec::ParameterTypeFlag));
    spec->AddParameter(ParameterSpec::New("dd", CallSpec::ParameterTypeString));
    return spec;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::istringstream lines(std::string(reinterpret_cast<const char*>(data), size));
    const auto spec = Declaration();
    const auto command = AutoCli::ExtensionCommand::New();
    command->SetInputSpec(spec);
    std::string line;
    std::getline(lines, line);
    command->SetExecuteCommand(line);
    command->SetStdin(line);

    const auto input = CallSpec::Input::New();
    constexpr const char* names[] = {"aa", "bb", "cc", "bb"};
    for (size_t i = 0; i < std::size(names) && std::getline(lines, line); ++i) {
        input->AddParameter(names[i], line);
    }
    input->SetInputSpec(spec);
    for (const bool isStdin : {false, true}) {
        try {
            const std::string text = command->SubstituteInput(input, isStdin);
            if (text.find('\0') != std::string::npos) {
                std::abort();
            }
        } catch (const Zelmar::ZelmarException&) {
            // The template reads the flag or the list as one value.
        }
    }
    return 0;
}
