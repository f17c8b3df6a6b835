#include <zelmar/autocli/extension/Descriptor.h>
#include <zelmar/autocli/extension/Rethrow.h>
#include <zelmar/autocli/extension/StreamInt.h>
#include <zelmar/autocli/extension/XmlUtil.h>

#include <algorithm>

using CallSpec::InputSpec;
using CallSpec::ParameterConstraint;
using CallSpec::ParameterConstraintType;
using CallSpec::ParameterSpec;
using CallSpec::ParameterType;
using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

// The row of a table for the word in a `type` attribute, or null.
template <class Row, size_t Count>
const Row* FindRow(const Row (&rows)[Count], std::string_view type) {
    const Row* row = std::ranges::find(rows, type, &Row::type);
    return row == std::end(rows) ? nullptr : row;
}

struct ParameterKind {
    std::string_view type;
    ParameterType parameterType;
};

constexpr ParameterKind parameterKinds[] = {
    {"string", CallSpec::ParameterTypeString},
    {"int", CallSpec::ParameterTypeInt},
    {"bool", CallSpec::ParameterTypeBool},
    {"flag", CallSpec::ParameterTypeFlag},
    {"string-list", CallSpec::ParameterTypeStringList},
    {"int-list", CallSpec::ParameterTypeIntList},
    {"bool-list", CallSpec::ParameterTypeBoolList},
};

// What fills a constraint from its data element tells whether there was any data.
bool FillStringEnum(const XmlNode& node, ParameterConstraint& constraint) {
    const auto entries = ExtractEnum(node);
    for (const auto& [value, description] : entries) {
        constraint.AddStringEnum(value, description);
    }
    return !entries.empty();
}

bool FillIntEnum(const XmlNode& node, ParameterConstraint& constraint) {
    const auto entries = ExtractEnum(node);
    for (const auto& [value, description] : entries) {
        const auto number = ReadStreamInt(value);
        if (!number) {
            throw ZelmarException("Error parsing integer enumeration. Expected integer, but got " +
                                  value);
        }
        constraint.AddIntEnum(*number, description);
    }
    return !entries.empty();
}

bool FillRegex(const XmlNode& node, ParameterConstraint& constraint) {
    const std::string regex(XmlUtil_GetContent(node));
    if (regex.empty()) {
        throw ZelmarException(
            "Error parsing regex from parameter constraint.Missing or empty 'regex' tag");
    }
    constraint.SetStringRegex(regex);
    return true;
}

bool FillRange(const XmlNode& node, ParameterConstraint& constraint) {
    const auto min = ReadStreamInt(XmlUtil_ExtractAttribute(node, "min"));
    const auto max = ReadStreamInt(XmlUtil_ExtractAttribute(node, "max"));
    if (!min || !max) {
        throw ZelmarException(
            "Error parsing 'range' parameter constraint.  Range requires both 'min' and 'max'"
            " attributes and that both are integers.");
    }
    constraint.SetIntRange(*min, *max);
    return true;
}

struct ConstraintKind {
    std::string_view type;
    ParameterConstraintType constraintType;
    std::string_view dataTag;
    bool (*fill)(const XmlNode& node, ParameterConstraint& constraint);
};

constexpr ConstraintKind constraintKinds[] = {
    {"stringenum", CallSpec::ConstraintTypeStringEnum, "enum", FillStringEnum},
    {"intenum", CallSpec::ConstraintTypeIntEnum, "enum", FillIntEnum},
    {"regex", CallSpec::ConstraintTypeStringRegex, "regex", FillRegex},
    {"range", CallSpec::ConstraintTypeIntRange, "range", FillRange},
};

bool IsTruthWord(const std::string& word) {
    return word == "true" || word == "false";
}

// The attributes of a <parameter> and its description, as they stand in the file.
struct ParameterText {
    std::string name;
    std::string type;
    std::string required;
    std::string secret;
    std::string shortName;
    std::string description;
};

ParameterText ReadParameterText(const XmlNode& node) {
    const auto attribute = [&node](std::string_view name) {
        return std::string(XmlUtil_ExtractAttribute(node, name));
    };
    return {
        attribute("name"),      attribute("type"),
        attribute("required"),  attribute("secret"),
        attribute("shortname"), std::string(XmlUtil_GetContentForChildByTag(node, "description"))};
}

ParameterType CheckParameterText(const ParameterText& text) {
    if (text.name.empty()) {
        throw ZelmarException(
            "Unable to parse Input Parameter.  Missing required attribute: 'name'");
    }
    const ParameterKind* kind = FindRow(parameterKinds, text.type);
    if (!kind) {
        throw ZelmarException(
            "Unable to parse Input Parameter " + text.name +
            ". Missing or invalid required attribute: 'type'.  Must be one of [string,"
            " string-list, bool, bool-list, int, int-list]");
    }
    if (!IsTruthWord(text.required)) {
        throw ZelmarException("Unable to parse Input Paramter " + text.name +
                              ". Missing or invalid 'required', must be one of ['true', 'false']");
    }
    if (text.description.empty()) {
        throw ZelmarException("Unable to parse Input Paramter " + text.name +
                              ". Missing command description");
    }
    if (!text.secret.empty() && !IsTruthWord(text.secret)) {
        throw ZelmarException("Unable to parse Input Paramter " + text.name +
                              ". Invalid 'secret', must be one of ['true', 'false']");
    }
    if (text.secret == "true" && kind->parameterType != CallSpec::ParameterTypeString) {
        throw ZelmarException("Unable to parse Input Paramter " + text.name + ". Invalid type " +
                              text.type + " for secret, must be 'string'");
    }
    return kind->parameterType;
}

}  // namespace

void ExtractInputParam(const XmlNode& node, InputSpec& inputSpec) {
    ParameterText text = ReadParameterText(node);
    auto parameter = ParameterSpec::New(text.name, CheckParameterText(text));
    if (!text.shortName.empty()) {
        parameter->SetShortName(text.shortName);
    }
    parameter->SetDescription(std::move(text.description));
    parameter->SetRequired(text.required == "true");
    if (text.secret == "true") {
        parameter->SetSecret(true);
    }
    const std::string context =
        "Unable to build parameter constraint for parameter " + text.name + ".  Error was: ";
    for (const XmlNode& child : node) {
        if (child.name == "constraint") {
            WithContext(context, [&] { parameter->SetConstraint(ExtractParamConstraint(child)); });
        }
    }
    inputSpec.AddParameter(parameter);
}

std::shared_ptr<ParameterConstraint> ExtractParamConstraint(const XmlNode& node) {
    const std::string_view type = XmlUtil_ExtractAttribute(node, "type");
    const ConstraintKind* kind = FindRow(constraintKinds, type);
    if (!kind) {
        throw ZelmarException(
            "Missing or invalid constraint 'type', must be one of [stringenum, intenum, regex,"
            " range] got '" +
            std::string(type) + "'");
    }
    std::shared_ptr<ParameterConstraint> constraint;
    bool hasData = false;
    for (const XmlNode& child : node) {
        if (child.name == kind->dataTag) {
            constraint = ParameterConstraint::New(kind->constraintType);
            hasData = kind->fill(child, *constraint) || hasData;
        }
    }
    if (!hasData) {
        throw ZelmarException(
            "Error parsing parameter constraint.  There was no data included inside the"
            " <constraint> tag for the given constraint type");
    }
    return constraint;
}

std::vector<std::pair<std::string, std::string>> ExtractEnum(const XmlNode& node) {
    std::vector<std::pair<std::string, std::string>> entries;
    for (const XmlNode& child : node) {
        if (!XmlUtil_IsTagged(child)) {
            continue;
        }
        if (child.name != "enum-value") {
            throw ZelmarException(
                "Found unexpected tag while building an enum.  Unexpected tag was: " +
                std::string(child.name));
        }
        const std::string_view value = XmlUtil_ExtractAttribute(child, "value");
        for (const XmlNode& text : child) {
            if (!text.content) {
                continue;
            }
            if (value.empty()) {
                throw ZelmarException(
                    "Error parsing 'enum-value', missing required attribute 'value'");
            }
            entries.emplace_back(value, *text.content);
        }
    }
    return entries;
}

}  // namespace AutoCli
