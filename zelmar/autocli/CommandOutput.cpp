#include <zelmar/autocli/CommandOutput.h>

namespace AutoCli {

CommandOutput::~CommandOutput() = default;

std::shared_ptr<CommandOutput> CommandOutput::New() {
    return std::make_shared<CommandOutput>();
}

}  // namespace AutoCli
