#include <author/test/ProbeCalls.h>

#include <algorithm>

namespace Author {

namespace {

using CallSpec::ParameterSpec;

bool IsText(const ParameterSpec& spec) {
    return spec.GetType() == CallSpec::ParameterTypeString ||
           spec.GetType() == CallSpec::ParameterTypeStringList;
}

bool Accepts(const ParameterSpec& spec, const std::string& value) {
    const auto constraint = spec.GetConstraint();
    return !constraint || constraint->Validate(value, spec.GetName(), CallSpec::Output::New());
}

// The values that a constraint names, or those of the type.
std::vector<std::string> NamedValues(const ParameterSpec& spec) {
    std::vector<std::string> values;
    const auto constraint = spec.GetConstraint();
    const auto type =
        constraint ? constraint->GetType() : CallSpec::ParameterConstraintType::ConstraintTypeNone;
    if (type == CallSpec::ConstraintTypeStringEnum) {
        values = constraint->GetStringEnum();
    } else if (type == CallSpec::ConstraintTypeIntEnum) {
        std::ranges::transform(constraint->GetIntEnum(), std::back_inserter(values),
                               [](long value) { return std::to_string(value); });
    } else if (type == CallSpec::ConstraintTypeIntRange) {
        long min = 0;
        long max = 0;
        constraint->GetIntRange(min, max);
        values = {std::to_string(min), std::to_string(max)};
    } else if (spec.GetType() == CallSpec::ParameterTypeFlag) {
        values = {""};
    } else if (spec.GetType() == CallSpec::ParameterTypeBool ||
               spec.GetType() == CallSpec::ParameterTypeBoolList) {
        values = {"yes", "no"};
    } else if (!IsText(spec)) {
        values = {"1", "-9223372036854775808", "9223372036854775807"};
    }
    return values;
}

// What harmless values there may be.
std::vector<std::string> PlainValues(const ParameterSpec& spec) {
    std::vector<std::string> values = NamedValues(spec);
    for (const char* value : {"text", "a", "1", "A", "root", "/tmp", "a.b", "127.0.0.1", "*"}) {
        if (IsText(spec) && Accepts(spec, value)) {
            values.emplace_back(value);
        }
    }
    return values;
}

std::vector<std::string> HostileValues(const std::string& name) {
    const std::string touch = std::string("touch ") + canary;
    return {"$(" + touch + ")",
            "`" + touch + "`",
            "; " + touch + " #",
            "'; " + touch + " #",
            "\"; " + touch + " #",
            "x\n" + touch + "\n",
            "x #\n" + touch + " #",
            "| " + touch + " #",
            "$multilist{" + name + ",x,false}' #\n" + touch + " #",
            "$val{" + name + "}",
            "$if{" + name + ",x}",
            "x}",
            "{",
            "'\"\\",
            "-x",
            "",
            "\xff\xfe",
            "<&>]]>",
            std::string(100000, 'x')};
}

}  // namespace

std::optional<std::vector<ProbeCall>> ProbeCallsOf(AutoCli::Command& command,
                                                   std::string& unknown) {
    const auto& specs = command.GetInputSpec()->GetParameterSpecs();
    ProbeCall least;
    for (const auto& spec : specs) {
        if (spec->IsRequired()) {
            const auto values = PlainValues(*spec);
            if (values.empty()) {
                unknown = spec->GetName();
                return std::nullopt;
            }
            least.parameters.emplace_back(spec->GetName(), values.front());
        }
    }
    std::vector<ProbeCall> calls = {least,
                                    {least.parameters, ProbeCall::Environment::NoLang},
                                    {least.parameters, ProbeCall::Environment::Empty}};
    for (const auto& spec : specs) {
        const std::string name = spec->GetName();
        ProbeCall without = least;
        std::erase_if(without.parameters, [&](const auto& given) { return given.first == name; });
        if (spec->IsRequired()) {
            calls.push_back({without.parameters, ProbeCall::Environment::Whole, true});
        }
        std::vector<std::string> values =
            name == "help" ? std::vector<std::string>{""} : PlainValues(*spec);
        if (IsText(*spec)) {
            std::ranges::move(HostileValues(name), std::back_inserter(values));
        }
        for (const std::string& value : values) {
            ProbeCall call = without;
            call.parameters.emplace_back(name, value);
            if (call != least) {
                calls.push_back(std::move(call));
            }
        }
    }
    return calls;
}

}  // namespace Author
