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

// Each of these gives the reason to refuse a value, or nothing.

std::string RefuseInt(const ParameterConstraint& constraint, const std::string& value,
                      const std::string& parameterName) {
    long number = 0;
    if (!ParameterSpec::GetInt(value, number)) {
        return "Invalid data type for parameter '" + parameterName + "'. Expected an Integer";
    }
    if (constraint.GetType() == ConstraintTypeIntEnum) {
        return Contains(constraint.GetIntEnum(), number)
                   ? ""
                   : Violation(parameterName) + "Expected a single value from the set " +
                         constraint.ToString();
    }
    long min = 0;
    long max = 0;
    constraint.GetIntRange(min, max);
    return min <= number && number <= max
               ? ""
               : Violation(parameterName) + "Expected " + constraint.ToString();
}

std::string RefuseString(const ParameterConstraint& constraint, const std::string& value,
                         const std::string& parameterName) {
    return Contains(constraint.GetStringEnum(), value)
               ? ""
               : Violation(parameterName) + "Expected a single value from the set " +
                     constraint.ToString() + " got '" + value + "'";
}

std::string RefuseMismatch(const std::string& regex, const std::string& value,
                           const std::string& parameterName) {
    try {
        return boost::regex_match(value, boost::regex(regex))
                   ? ""
                   : Violation(parameterName) +
                         "Value does not match the expected regular expression (" + regex + ")";
    } catch (const std::runtime_error& error) {
        // The expression is broken, or the matcher gave up before it took exponential time.
        return Violation(parameterName) + "Unable to apply the regular expression (" + regex +
               "): " + error.what();
    }
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

void ParameterConstraint::AddIntEnum(long value, std::string description) {
    if (Contains(_intEnum, value)) {
        throw ZelmarException("Duplicate Value found in ParameterConstraint::AddIntEnum");
    }
    if (!description.empty()) {
        _intEnumDesc[value] = std::move(description);
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
    std::string refusal;
    switch (_type) {
        case ConstraintTypeNone:
            return true;
        case ConstraintTypeIntRange:
        case ConstraintTypeIntEnum:
            refusal = RefuseInt(*this, value, parameterName);
            break;
        case ConstraintTypeStringEnum:
            refusal = RefuseString(*this, value, parameterName);
            break;
        case ConstraintTypeStringRegex:
            refusal = RefuseMismatch(_regex, value, parameterName);
            break;
        default:
            return false;
    }
    if (!refusal.empty()) {
        output->AddErrorMessage(refusal);
    }
    return refusal.empty();
}

}  // namespace CallSpec
