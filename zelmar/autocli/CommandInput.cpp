#include <zelmar/autocli/CommandInput.h>

#include <boost/algorithm/string/join.hpp>

namespace AutoCli {

CommandInput::~CommandInput() = default;

std::shared_ptr<CommandInput> CommandInput::New() {
    return std::make_shared<CommandInput>();
}

std::string CommandInput::GetCommandPathString() const {
    return boost::algorithm::join(_commandPath, " ");
}

}  // namespace AutoCli
