#include <zelmar/ZelmarException.h>
#include <zelmar/callspec/Output.h>
#include <zelmar/callspec/ParameterConstraint.h>
#include <zelmar/callspec/ParameterSpec.h>

#include <boost/algorithm/string/join.hpp>
#include <boost/regex.hpp>

#include <algorithm>

using Zelmar::ZelmarException;

namespace CallSpec {

namespace {

std::string SetText(const std::vector<std::string>& members) {
    return "[" + boost::algorithm::join(members, ", ") + "]";
}

std::string SetText(const std::vector<long>& members) {
    std::vector<std::string> texts;
    texts.reserve(members.size());
    for (const long member : members) {
        texts.push_back(std::to_string(member));
    }
    return SetText(texts);
}

template <class Value>
bool Contains(const std::vector<Value>& values, const Value& value) {
    return std::ranges::find(values, value) != values.end();
}

std::string Violation(const std::string& parameterName) {
    return "Invalid data constraint for parameter '" + parameterName + "'. ";
}

}  // namespace

std::shared_ptr<ParameterConstraint> ParameterConstraint::New(ParameterConstraintType type) {
    return std::make_shared<ParameterConstraint>(type);
}

void ParameterConstraint::SetIntRange(long min, long max) {
    if (min > max) {
        throw ZelmarException(
            "Invalid values for SetIntRange, constraints must have a min value <= max value");
    }
    _min = min;
    _max = max;
}

void ParameterConstraint::GetIntRange(long& min, long& max) const {
    min = _min;
    max = _max;
}

void ParameterConstraint::AddIntEnum(long value) {
    if (Contains(_intEnum, value)) {
        throw ZelmarException("Duplicate Value found in ParameterConstraint::AddIntEnum");
    }
    _intEnum.push_back(value);
}

void ParameterConstraint::AddStringEnum(std::string value, std::string description) {
    if (Contains(_stringEnum, value)) {
        throw ZelmarException("Duplicate Value found in ParameterConstraint::AddStringEnum: " +
                              value);
    }
    if (!description.empty()) {
        _stringEnumDesc[value] = std::move(description);
    }
    _stringEnum.push_back(std::move(value));
}

void ParameterConstraint::AddStringEnum(const char* value, const char* description) {
    AddStringEnum(std::string(value), std::string(description));
}

std::string ParameterConstraint::ToString() const {
    switch (_type) {
        case ConstraintTypeNone:
            return "no constraint";
        case ConstraintTypeIntRange:
            return "integer in the range " + std::to_string(_min) + "-" + std::to_string(_max);
        case ConstraintTypeIntEnum:
            return SetText(_intEnum);
        case ConstraintTypeStringEnum:
            return SetText(_stringEnum);
        case ConstraintTypeStringRegex:
            return "a string matching the regular expression " + _regex;
    }
    return "unknown";
}

bool ParameterConstraint::Validate(const std::string& value, const std::string& parameterName,
                                   const std::shared_ptr<Output>& output) const {
    switch (_type) {
        case ConstraintTypeNone:
            return true;
        case ConstraintTypeIntRange:
        case ConstraintTypeIntEnum:
            return ValidateInt(value, parameterName, *output);
        case ConstraintTypeStringEnum:
            return ValidateStringEnum(value, parameterName, *output);
        case ConstraintTypeStringRegex:
            return ValidateRegex(value, parameterName, *output);
    }
    return false;
}

bool ParameterConstraint::AcceptsInt(long value) const {
    return _type == ConstraintTypeIntRange ? _min <= value && value <= _max
                                           : Contains(_intEnum, value);
}

bool ParameterConstraint::ValidateInt(const std::string& value, const std::string& parameterName,
                                      Output& output) const {
    long number = 0;
    if (!ParameterSpec::GetInt(value, number)) {
        output.AddErrorMessage("Invalid data type for parameter '" + parameterName +
                               "'. Expected an Integer");
        return false;
    }
    if (!AcceptsInt(number)) {
        output.AddErrorMessage(Violation(parameterName) +
                               (_type == ConstraintTypeIntRange
                                    ? "Expected "
                                    : "Expected a single value from the set ") +
                               ToString());
        return false;
    }
    return true;
}

bool ParameterConstraint::ValidateStringEnum(const std::string& value,
                                             const std::string& parameterName,
                                             Output& output) const {
    if (Contains(_stringEnum, value)) {
        return true;
    }
    output.AddErrorMessage(Violation(parameterName) + "Expected a single value from the set " +
                           ToString() + " got '" + value + "'");
    return false;
}

bool ParameterConstraint::ValidateRegex(const std::string& value, const std::string& parameterName,
                                        Output& output) const {
    try {
        if (boost::regex_match(value, boost::regex(_regex))) {
            return true;
        }
        output.AddErrorMessage(Violation(parameterName) +
                               "Value does not match the expected regular expression (" + _regex +
                               ")");
    } catch (const std::runtime_error& error) {
        // The expression is broken, or the matcher gave up before it took exponential time.
        output.AddErrorMessage(Violation(parameterName) +
                               "Unable to apply the regular expression (" + _regex +
                               "): " + error.what());
    }
    return false;
}

}  // namespace CallSpec
