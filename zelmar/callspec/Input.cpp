#include <zelmar/ZelmarException.h>
#include <zelmar/callspec/Input.h>
#include <zelmar/callspec/InputSpec.h>

#include <boost/algorithm/string/join.hpp>

using Zelmar::ZelmarException;

namespace CallSpec {

namespace {

const std::string emptyString;

bool SpellsTrue(const std::string& value) {
    bool truth = false;
    return ParameterSpec::GetBool(value, truth) && truth;
}

}  // namespace

Input::~Input() = default;

std::shared_ptr<Input> Input::New() {
    return std::make_shared<Input>();
}

void Input::SetInputSpec(std::shared_ptr<InputSpec> spec) {
    _inputSpec = std::move(spec);
    for (const auto& parameter : _inputSpec->GetParameterSpecs()) {
        const std::string& shortName = parameter->GetShortName();
        auto given = shortName.empty() ? _parameters.end() : _parameters.find(shortName);
        if (given != _parameters.end()) {
            auto& values = _parameters[parameter->GetName()];
            values.insert(values.end(), given->second.begin(), given->second.end());
            _parameters.erase(given);
        }
    }
}

void Input::AddParameter(const std::string& name, const std::string& value) {
    _parameters[name].push_back(value);
}

bool Input::HasParameter(const std::string& name) const {
    return _parameters.contains(name);
}

bool Input::HasParameter(const char* name) const {
    return HasParameter(std::string(name));
}

const std::vector<std::string>& Input::Values(const std::string& name) const {
    static const std::vector<std::string> none;
    const auto values = _parameters.find(name);
    return values == _parameters.end() ? none : values->second;
}

void Input::GetParameterList(const std::string& name, std::vector<std::string>& out) const {
    const auto& values = Values(name);
    out.insert(out.end(), values.begin(), values.end());
}

void Input::GetParameterList(const char* name, std::vector<std::string>& out) const {
    GetParameterList(std::string(name), out);
}

void Input::GetParameterIntList(const std::string& name, std::vector<long>& out) const {
    const auto& values = Values(name);
    out.reserve(out.size() + values.size());
    for (const std::string& value : values) {
        long number = 0;
        if (ParameterSpec::GetInt(value, number)) {
            out.push_back(number);
        }
    }
}

void Input::GetParameterBoolList(const std::string& name, std::vector<bool>& out) const {
    const auto& values = Values(name);
    out.reserve(out.size() + values.size());
    for (const std::string& value : values) {
        out.push_back(SpellsTrue(value));
    }
}

std::string Input::GetParameterListAsString(const std::string& name, char separator,
                                            bool quote) const {
    const std::string text = boost::algorithm::join(Values(name), std::string(1, separator));
    return quote ? "\"" + text + "\"" : text;
}

ParameterType Input::GetParameterType(const std::string& name) const {
    const ParameterSpec* parameter = _inputSpec ? _inputSpec->FindParameterSpec(name) : nullptr;
    if (!parameter) {
        throw ZelmarException("Request for unknown parameter: " + name);
    }
    return parameter->GetParameterType();
}

const std::string& Input::GetParameter(const std::string& name) const {
    const ParameterType type = GetParameterType(name);
    if (type == ParameterTypeFlag) {
        throw ZelmarException("Request for GetParameter on a flag type parameter: " + name);
    }
    if (type > ParameterTypeFlag) {
        throw ZelmarException(
            "Request for GetParameter on a parameter that can have multiple values: " + name);
    }
    const auto& values = Values(name);
    return values.size() == 1 ? values.front() : emptyString;
}

const std::string& Input::GetParameter(const char* name) const {
    return GetParameter(std::string(name));
}

long Input::GetParameterInt(const std::string& name) const {
    long number = -1;
    ParameterSpec::GetInt(GetParameter(name), number);
    return number;
}

long Input::GetParameterInt(const char* name) const {
    return GetParameterInt(std::string(name));
}

bool Input::GetParameterBool(const std::string& name) const {
    return SpellsTrue(GetParameter(name));
}

bool Input::GetParameterBool(const char* name) const {
    return GetParameterBool(std::string(name));
}

const std::string& Input::GetContext(const std::string& key) const {
    const auto value = _context.find(key);
    return value == _context.end() ? emptyString : value->second;
}

}  // namespace CallSpec
