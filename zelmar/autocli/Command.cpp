#include <zelmar/autocli/Command.h>
#include <zelmar/autocli/CommandInput.h>

using CallSpec::Input;
using CallSpec::Output;

namespace AutoCli {

namespace {

std::string LabelOf(const Command& command, const std::shared_ptr<Input>& input) {
    const auto call = std::dynamic_pointer_cast<CommandInput>(input);
    return call ? call->GetCommandPathString() : command.GetName();
}

void CheckOutput(CommandSpec& command, const std::shared_ptr<Output>& output) {
    std::vector<std::string> errors;
    if (!command.GetOutputSpec()->Validate(output, &errors)) {
        for (std::string& error : errors) {
            output->AddErrorMessage(std::move(error));
        }
        output->AddErrorMessage(
            "Implementation error! The output of this command does not match the declared output"
            " type, see errors above.");
    }
}

}  // namespace

Command::~Command() = default;

void Command::Execute(const std::shared_ptr<Input>& input, const std::shared_ptr<Output>& output) {
    if (input->HasParameter("help")) {
        GenerateHelpOutput(input, output);
        return;
    }
    try {
        ExecuteInternal(input, output);
    } catch (const std::exception& error) {
        output->AddErrorMessage("Error on command " + LabelOf(*this, input) + " : " + error.what());
    }
    if (!output->HasError()) {
        CheckOutput(*this, output);
    }
}

}  // namespace AutoCli
