#include "Result.h"

#include <cmath>
#include <new>

#include "Schema.h"

using AutoCli::Command;
using AutoCli::CommandInput;
using AutoCli::CommandOutput;
using CallSpec::ParameterSpec;

namespace {

/// Moves the arguments of a call into the input, as the texts that a command line would bring.
class Arguments {
public:
    Arguments(CommandInput& input, CommandOutput& output) : _input(input), _output(output) {}

    void Add(const CallSpec::InputSpec& spec, const Json& arguments) {
        for (const auto& [name, value] : arguments.items()) {
            const ParameterSpec* parameter = spec.FindParameterSpec(name);
            if (!parameter || name == "help") {
                _output.AddErrorMessage("Unknown parameter : " + name);
            } else if (value.is_array()) {
                for (const Json& item : value) {
                    AddValue(*parameter, item);
                }
            } else {
                AddValue(*parameter, value);
            }
        }
    }

private:
    void AddValue(const ParameterSpec& parameter, const Json& value) {
        if (value.is_boolean() && parameter.GetParameterType() == CallSpec::ParameterTypeFlag) {
            if (value.get<bool>()) {
                _input.AddParameter(parameter.GetName(), "");
            }
        } else if (value.is_string()) {
            AddText(parameter, value.get<std::string>());
        } else if (value.is_boolean() || value.is_number_integer()) {
            AddText(parameter, value.dump());
        } else if (value.is_number() && IsWhole(value.get<double>())) {
            AddText(parameter, std::to_string(static_cast<long>(value.get<double>())));
        } else if (!value.is_null()) {  // which is what some clients say for "not given"
            _output.AddErrorMessage("Invalid value for parameter '" + parameter.GetName() +
                                    "': " + value.type_name());
        }
    }

    void AddText(const ParameterSpec& parameter, const std::string& text) {
        if (text.find('\0') != std::string::npos) {
            _output.AddErrorMessage("Invalid value for parameter '" + parameter.GetName() +
                                    "': it holds a NUL character");
        } else {
            _input.AddParameter(parameter.GetName(), text);
        }
    }

    static bool IsWhole(double number) {
        constexpr double largest = 9007199254740992;  // 2^53: below, each whole number is exact
        return std::abs(number) <= largest && std::trunc(number) == number;
    }

    CommandInput& _input;
    CommandOutput& _output;
};

struct TooLarge : std::exception {};

std::string ValueText(const MetaObj::MetaObject* value, size_t limit) {
    std::string text;
    AutoCli::AutoCli_WriteJsonText(value, [&](std::string_view piece) {
        if (piece.size() > limit - text.size()) {
            throw TooLarge();
        }
        text += piece;
    });
    return text;
}

std::string Success(const MetaObj::MetaObject* value, size_t limit) {
    const std::string text = ValueText(value, limit);
    return R"({"content":[{"type":"text","text":)" + Json(text).dump() +
           R"(}],"structuredContent":)" + (IsObject(value) ? text : R"({"result":)" + text + "}") +
           R"(,"isError":false})";
}

std::string Complaints(const CallSpec::Output& output) {
    std::string text;
    for (const std::string& message : output.GetErrors()) {
        text += (text.empty() ? "" : "\n") + message;
    }
    return text;
}

void ReplaceAll(std::string& text, const std::string& from, std::string_view to) {
    for (size_t at = text.find(from); !from.empty() && at != std::string::npos;
         at = text.find(from, at + to.size())) {
        text.replace(at, from.size(), to);
    }
}

// True when the command ran and gave a value.
bool Run(AutoCli::Dispatcher& dispatcher, Command& command, const Json& arguments,
         const std::shared_ptr<CommandOutput>& output) {
    const auto input = CommandInput::New();
    input->SetDispatcher("kelvash");
    input->SetCommandPath(command.GetPath());
    Arguments(*input, *output).Add(*command.GetInputSpec(), arguments);
    if (output->HasError()) {
        command.GetInputSpec()->Validate(input, output);  // for the complaints of the engine
        return false;
    }
    return dispatcher.ExecuteCommand(input, output);
}

}  // namespace

std::string CallTool(AutoCli::Dispatcher& dispatcher, Command& command, const Json& arguments,
                     size_t limit) {
    try {
        const auto output = CommandOutput::New();
        return Run(dispatcher, command, arguments, output)
                   ? Success(output->GetRootObject().get(), limit)
                   : FailedCall(WithoutSecrets(Complaints(*output), command, arguments));
    } catch (const TooLarge&) {
        return FailedCall("The result has more than " + std::to_string(limit) +
                          " bytes, the limit of this server (--max-result). Ask for less.");
    } catch (const std::bad_alloc&) {
        return FailedCall("There is not enough memory for the result. Ask for less.");
    } catch (const std::exception& error) {
        return FailedCall(error.what());
    }
}

std::string WithoutSecrets(std::string text, Command& command, const Json& arguments) {
    for (const auto& [name, value] : arguments.items()) {
        const ParameterSpec* parameter = command.GetInputSpec()->FindParameterSpec(name);
        if (parameter && parameter->IsSecret() && value.is_string()) {
            ReplaceAll(text, value.get_ref<const std::string&>(), "***");
        }
    }
    return text;
}

std::string FailedCall(const std::string& reason) {
    return TextOf({{"content", {{{"type", "text"}, {"text", reason}}}}, {"isError", true}});
}
