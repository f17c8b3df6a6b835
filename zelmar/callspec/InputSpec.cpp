#include <zelmar/ZelmarException.h>
#include <zelmar/callspec/Input.h>
#include <zelmar/callspec/InputSpec.h>
#include <zelmar/callspec/Output.h>

#include <algorithm>

using Zelmar::ZelmarException;

namespace CallSpec {

namespace {

const std::string& NameOf(const std::shared_ptr<ParameterSpec>& parameter) {
    return parameter->GetName();
}

}  // namespace

std::shared_ptr<InputSpec> InputSpec::New() {
    return std::make_shared<InputSpec>();
}

void InputSpec::AddParameter(const std::shared_ptr<ParameterSpec>& parameter) {
    const std::string& name = parameter->GetName();
    if (name.size() < 2) {
        throw ZelmarException("Parameter name must be at least 2 characters");
    }
    RequireNamesFree(*parameter);
    if (_parameters.empty() && name != "help") {
        _parameters.reserve(2);  // every command gets `help` as well
    }
    _parameters.insert(std::ranges::upper_bound(_parameters, name, {}, NameOf), parameter);
}

void InputSpec::RequireNamesFree(const ParameterSpec& parameter) const {
    const std::string& name = parameter.GetName();
    const std::string& shortName = parameter.GetShortName();
    for (const auto& taken : _parameters) {
        if (taken->GetName() == name) {
            throw ZelmarException(
                "Found a duplicate paramater specification for parameter named '" + name + "'");
        }
        if (!shortName.empty() && taken->GetShortName() == shortName) {
            throw ZelmarException("Invalid short name specified for --" + name +
                                  ". The short name -" + shortName + " is already used for --" +
                                  taken->GetName());
        }
    }
}

const ParameterSpec* InputSpec::FindParameterSpec(const std::string& name) const {
    const auto found = std::ranges::lower_bound(_parameters, name, {}, NameOf);
    return found != _parameters.end() && (*found)->GetName() == name ? found->get() : nullptr;
}

const ParameterSpec* InputSpec::FindOption(const std::string& name) const {
    const auto found = std::ranges::find_if(_parameters, [&name](const auto& parameter) {
        return parameter->GetName() == name || parameter->GetShortName() == name;
    });
    return found == _parameters.end() ? nullptr : found->get();
}

bool InputSpec::Validate(const std::shared_ptr<Input>& input,
                         const std::shared_ptr<Output>& output) const {
    if (input->HasParameter("help")) {
        return true;
    }
    bool valid = true;
    for (const auto& [name, values] : input->GetParameters()) {
        const ParameterSpec* parameter = FindParameterSpec(name);
        if (!parameter) {
            output->AddErrorMessage("Unknown parameter : " + name);
            valid = false;
        } else if (!parameter->Validate(values, output)) {
            valid = false;
        }
    }
    for (const auto& parameter : _parameters) {
        if (parameter->IsRequired() && !input->HasParameter(parameter->GetName())) {
            output->AddErrorMessage("Missing required parameter --" + parameter->GetName());
            valid = false;
        }
    }
    return valid;
}

}  // namespace CallSpec
