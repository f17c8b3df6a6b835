#include <zelmar/ZelmarException.h>
#include <zelmar/callspec/Output.h>
#include <zelmar/callspec/ParameterSpec.h>
#include <zelmar/internal/Ascii.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <string_view>

using Zelmar::ZelmarException;

namespace CallSpec {

namespace {

constexpr std::array<std::string_view, 7> trueWords = {"1", "yes", "y", "true", "True", "t", "T"};
constexpr std::array<std::string_view, 7> falseWords = {"0", "no", "n", "false", "False", "f", "F"};

bool IsNameCharacter(char c) {
    return Ascii::IsLower(c) || Ascii::IsDigit(c) || c == '-';
}

bool Fits(ParameterConstraintType constraint, ParameterType type) {
    switch (constraint) {
        case ConstraintTypeIntRange:
        case ConstraintTypeIntEnum:
            return type == ParameterTypeInt || type == ParameterTypeIntList;
        case ConstraintTypeStringEnum:
        case ConstraintTypeStringRegex:
            return type == ParameterTypeString || type == ParameterTypeStringList;
        default:
            return false;
    }
}

std::string DescribedMembers(const ParameterConstraint& constraint) {
    if (constraint.GetType() != ConstraintTypeStringEnum) {
        return "";
    }
    std::string text;
    for (const auto& [value, description] : constraint.GetStringEnumWithDesc()) {
        text.append("\n    ").append(value).append(": ").append(description);
    }
    return text + "\n";
}

void ReplaceFirst(std::string& text, std::string_view placeholder, const std::string& replacement) {
    const size_t place = text.find(placeholder);
    if (place != std::string::npos) {
        text.replace(place, placeholder.size(), replacement);
    }
}

// The end of the message about a value that does not fit the type; null when it fits.
const char* ComplaintAbout(const std::string& value, ParameterType type) {
    long number = 0;
    bool truth = false;
    switch (type) {
        case ParameterTypeInt:
        case ParameterTypeIntList:
            return ParameterSpec::GetInt(value, number) ? nullptr : " expected type Integer";
        case ParameterTypeBool:
        case ParameterTypeBoolList:
            if (ParameterSpec::GetBool(value, truth)) {
                return nullptr;
            }
            return " expected one of [1, 0, y, n, true, false, True, False, yes, no, t, f, T, F]";
        case ParameterTypeFlag:
            return value.empty() ? nullptr
                                 : ".  This parameter is a flag and cannot accept any values. ";
        default:
            return nullptr;
    }
}

}  // namespace

ParameterSpec::ParameterSpec(std::string&& name, ParameterType type)
    : _type(type), _name(std::move(name)) {
    if (!Ascii::ConsistsOf(_name, IsNameCharacter)) {
        throw ZelmarException("Invalid Parameter name '" + _name +
                              "' parameter names can only contain lower-case alphanumeric"
                              " characters, numbers and '-'");
    }
}

std::shared_ptr<ParameterSpec> ParameterSpec::New(const std::string& name, ParameterType type) {
    return New(std::string(name), type);
}

std::shared_ptr<ParameterSpec> ParameterSpec::New(const char* name, ParameterType type) {
    return New(std::string(name), type);
}

std::shared_ptr<ParameterSpec> ParameterSpec::New(std::string&& name, ParameterType type) {
    return std::make_shared<ParameterSpec>(std::move(name), type);
}

void ParameterSpec::SetShortName(std::string shortName) {
    if (shortName.size() != 1 || !Ascii::IsAlnum(shortName[0])) {
        throw ZelmarException(
            "Invalid value for shortName, must be a single character a-z, A-Z or 0-9");
    }
    _shortName = std::move(shortName);
}

std::string ParameterSpec::GetDescription(bool expand) const {
    std::string text = _description;
    if (!expand || !_constraint) {
        return text;
    }
    // A placeholder counts only if the author wrote it: the words of a constraint that happen to
    // spell one bring no replacement of their own.
    const auto fill = [&](std::string_view placeholder, const std::string& replacement) {
        if (_description.find(placeholder) != std::string::npos) {
            ReplaceFirst(text, placeholder, replacement);
        }
    };
    fill("%REGEX%", _constraint->ToString());
    fill("%ENUM%", _constraint->ToString());
    fill("%FULLENUM%", DescribedMembers(*_constraint));
    return text;
}

void ParameterSpec::SetConstraint(const std::shared_ptr<ParameterConstraint>& constraint) {
    if (!constraint) {
        return;
    }
    if (!Fits(constraint->GetType(), _type)) {
        throw ZelmarException("Invalid constraint specified for parameter " + _name +
                              ".  The parameter constraint specified is not allowed for a"
                              " parameter of this type.");
    }
    _constraint = constraint;
}

void ParameterSpec::SetSecret(bool secret) {
    if (_type != ParameterTypeString) {
        throw ZelmarException("Cannot be set for parameter " + _name);
    }
    _secret = secret;
}

bool ParameterSpec::GetInt(const std::string& text, long& out) {
    char* end = nullptr;
    const long number = std::strtoll(text.c_str(), &end, 10);
    if (text.empty() || end != text.data() + text.size()) {
        return false;
    }
    out = number;
    return true;
}

bool ParameterSpec::GetBool(const std::string& text, bool& out) {
    const auto isIn = [&text](const auto& words) {
        return std::ranges::find(words, text) != words.end();
    };
    const bool isTrue = isIn(trueWords);
    if (!isTrue && !isIn(falseWords)) {
        return false;
    }
    out = isTrue;
    return true;
}

bool ParameterSpec::Validate(const std::vector<std::string>& values,
                             const std::shared_ptr<Output>& output) const {
    bool valid = ValidateCount(values.size(), *output);
    for (const std::string& value : values) {
        const bool fits = ValidateType(value, *output) &&
                          (!_constraint || _constraint->Validate(value, _name, output));
        valid = valid && fits;
    }
    return valid;
}

bool ParameterSpec::ValidateCount(size_t count, Output& output) const {
    if (count == 0) {
        output.AddErrorMessage("Missing value for parameter " + _name);
        return false;
    }
    if (count > 1 && !AllowMultiple()) {
        output.AddErrorMessage("Found multiple values for " + _name +
                               " this parameter can only accept a single value.");
        return false;
    }
    return true;
}

bool ParameterSpec::ValidateType(const std::string& value, Output& output) const {
    const char* complaint = ComplaintAbout(value, _type);
    if (complaint) {
        output.AddErrorMessage("Invalid data '" + value + "' for parameter " + _name + complaint);
    }
    return !complaint;
}

}  // namespace CallSpec
