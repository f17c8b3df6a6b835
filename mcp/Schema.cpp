#include "Schema.h"

#include <cctype>
#include <string_view>

using CallSpec::ParameterConstraint;
using CallSpec::ParameterSpec;
using MetaObj::MetaCast;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace {

Json ShapeOf(const MetaObject* prototype);

Json ShapeOf(const MetaStruct& structure) {
    Json shape = {{"type", "object"}, {"title", structure.GetTypeName()}};
    Json& properties = shape["properties"] = Json::object();
    Json& required = shape["required"] = Json::array();
    for (const auto& [name, field] : structure.GetFields()) {
        Json& property = properties[name] = ShapeOf(field.value.get());
        if (!field.documentation.empty()) {
            property["description"] = field.documentation;
        }
        required.push_back(name);
    }
    shape["additionalProperties"] = false;
    return shape;
}

Json TypeNamed(MetaType type) {
    switch (type) {
        case MetaType::Int:
            return {{"type", "integer"}};
        case MetaType::Bool:
            return {{"type", "boolean"}};
        case MetaType::String:
            return {{"type", "string"}};
        default:
            return Json::object();  // whatever it is
    }
}

Json ShapeOf(const MetaObject* prototype) {
    if (const auto* structure = MetaCast<MetaStruct>(prototype)) {
        return ShapeOf(*structure);
    }
    const auto* list = MetaCast<MetaList>(prototype);
    if (!list) {
        return prototype ? TypeNamed(prototype->GetType()) : Json::object();
    }
    const MetaStruct* item = list->GetListStructure().get();
    return {{"type", "array"}, {"items", item ? ShapeOf(*item) : TypeNamed(list->GetListType())}};
}

void AddMembers(const ParameterConstraint& constraint, Json& schema, std::string& description) {
    schema["enum"] = constraint.GetStringEnum();
    const auto& descriptions = constraint.GetStringEnumWithDesc();
    for (const std::string& member : constraint.GetStringEnum()) {
        if (const auto text = descriptions.find(member); text != descriptions.end()) {
            description += "\n- " + member + ": " + text->second;
        }
    }
}

void AddConstraint(const ParameterConstraint& constraint, Json& schema, std::string& description) {
    switch (constraint.GetType()) {
        case CallSpec::ConstraintTypeIntRange: {
            long min = 0;
            long max = 0;
            constraint.GetIntRange(min, max);
            schema["minimum"] = min;
            schema["maximum"] = max;
            return;
        }
        case CallSpec::ConstraintTypeIntEnum:
            schema["enum"] = constraint.GetIntEnum();
            return;
        case CallSpec::ConstraintTypeStringEnum:
            AddMembers(constraint, schema, description);
            return;
        case CallSpec::ConstraintTypeStringRegex:
            if (const std::string pattern = PatternFor(constraint.GetStringRegex());
                !pattern.empty()) {
                schema["pattern"] = pattern;
            }
            return;
        case CallSpec::ConstraintTypeNone:
            return;
    }
}

const char* TypeWord(CallSpec::ParameterType type) {
    switch (type) {
        case CallSpec::ParameterTypeInt:
        case CallSpec::ParameterTypeIntList:
            return "integer";
        case CallSpec::ParameterTypeBool:
        case CallSpec::ParameterTypeBoolList:
        case CallSpec::ParameterTypeFlag:
            return "boolean";
        default:
            return "string";
    }
}

Json SchemaOf(const ParameterSpec& parameter) {
    Json value = {{"type", TypeWord(parameter.GetParameterType())}};
    std::string description = parameter.GetDescription(true);
    if (const auto constraint = parameter.GetConstraint()) {
        AddConstraint(*constraint, value, description);
    }
    Json schema = value;
    if (parameter.AllowMultiple()) {
        schema = {{"type", "array"}, {"items", value}};
        if (parameter.IsRequired()) {
            schema["minItems"] = 1;
        }
    }
    if (parameter.IsSecret()) {
        schema["writeOnly"] = true;
    }
    schema["description"] = description;
    return schema;
}

// Takes over what both notations read alike (ECMA 262 with the flag "u", the stricter of its two).
// Everything else is left to the engine.
class PatternReader {
public:
    explicit PatternReader(const std::string& expression) : _rest(expression) {}

    std::string Read() {
        std::string pattern = "^(?:";
        while (!_rest.empty()) {
            const std::string piece = ReadPiece();
            if (piece.empty()) {
                return "";
            }
            pattern += piece;
        }
        return pattern + ")$";
    }

private:
    // Empty for what is not read alike; so do all of these.
    std::string ReadPiece() {
        switch (const char c = _rest.front()) {
            case '[':
                return ReadClass();
            case '\\':
                return ReadEscape("");
            case '(':
                return _rest.starts_with("(?") && !_rest.starts_with("(?:") ? "" : Take(1);
            case '*':
            case '+':
            case '?':
                return WithoutPlus(Take(1));
            case '{':
                return ReadCount();
            case '.':
                Take(1);
                return "[\\s\\S]";  // to the engine a line feed is a character like any other
            case ']':
            case '}':
            case '^':
            case '$':
                return "";
            default:
                return IsAscii(c) ? Take(1) : "";
        }
    }

    // Behind a repeat "?" means the same to both, and "+" does not.
    std::string WithoutPlus(std::string repeat) {
        if (_rest.starts_with("?")) {
            repeat += Take(1);
        }
        return _rest.starts_with("+") ? "" : repeat;
    }

    std::string ReadCount() {
        const size_t end = _rest.find_first_not_of("0123456789,", 1);
        const bool isCount = end > 1 && end < _rest.size() && _rest[end] == '}' && _rest[1] != ',';
        return isCount ? WithoutPlus(Take(end + 1)) : "";
    }

    // `alsoEscaped` needs its backslash at this place; other punctuation does without.
    std::string ReadEscape(std::string_view alsoEscaped) {
        if (_rest.size() < 2) {
            return "";
        }
        const char c = _rest[1];
        if (Holds("dDwWsStnrf^$\\.*+?()[]{}|/", c) || Holds(alsoEscaped, c)) {
            return Take(2);
        }
        if (std::ispunct(static_cast<unsigned char>(c)) == 0 || Holds("<>`'", c)) {
            return "";
        }
        Take(1);
        return Take(1);
    }

    std::string ReadClass() {
        std::string text = Take(1);
        if (_rest.starts_with("^")) {
            text += Take(1);
        }
        if (_rest.starts_with("]")) {
            return "";
        }
        while (!_rest.empty() && _rest.front() != ']') {
            const std::string piece = ReadInClass();
            const bool isSet = piece.size() == 2 && Holds("dDwWsS", piece[1]);
            if (piece.empty() || (isSet && _rest.starts_with("-") && !_rest.starts_with("-]"))) {
                return "";
            }
            text += piece;
        }
        return _rest.empty() ? "" : text + Take(1);
    }

    std::string ReadInClass() {
        if (_rest.front() == '\\') {
            return ReadEscape("-");
        }
        if (_rest.front() == '[') {
            return _rest.size() > 1 && Holds(":.=", _rest[1]) ? "" : "\\" + Take(1);
        }
        return IsAscii(_rest.front()) ? Take(1) : "";
    }

    static bool Holds(std::string_view set, char c) { return set.find(c) != set.npos; }
    static bool IsAscii(char c) { return static_cast<unsigned char>(c) < 0x80; }

    std::string Take(size_t count) {
        std::string text(_rest.substr(0, count));
        _rest.remove_prefix(count);
        return text;
    }

    std::string_view _rest;
};

}  // namespace

Json InputSchema(AutoCli::Command& command) {
    Json properties = Json::object();
    Json required = Json::array();
    for (const auto& parameter : command.GetInputSpec()->GetParameterSpecs()) {
        if (parameter->GetName() == "help") {
            continue;
        }
        properties[parameter->GetName()] = SchemaOf(*parameter);
        if (parameter->IsRequired()) {
            required.push_back(parameter->GetName());
        }
    }
    return {{"type", "object"},
            {"properties", std::move(properties)},
            {"required", std::move(required)},
            {"additionalProperties", false}};
}

Json OutputSchema(AutoCli::Command& command) {
    const auto prototype = command.GetOutputSpec()->GetRootObject();
    Json shape = ShapeOf(prototype.get());
    if (IsObject(prototype.get())) {
        return shape;
    }
    return {{"type", "object"},
            {"properties", {{"result", std::move(shape)}}},
            {"required", {"result"}},
            {"additionalProperties", false}};
}

bool IsObject(const MetaObject* value) {
    return MetaCast<MetaStruct>(value) != nullptr;
}

std::string PatternFor(const std::string& expression) {
    return PatternReader(expression).Read();
}
