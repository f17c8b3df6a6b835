#include <author/doc/Reference.h>

#include <algorithm>

using AutoCli::Command;
using AutoCli::NamespaceNode;
using CallSpec::ParameterConstraint;
using CallSpec::ParameterSpec;
using MetaObj::MetaCast;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;

namespace Author {

namespace {

const char* KindWord(CallSpec::ParameterType type) {
    switch (type) {
        case CallSpec::ParameterTypeInt:
        case CallSpec::ParameterTypeIntList:
            return "int";
        case CallSpec::ParameterTypeBool:
        case CallSpec::ParameterTypeBoolList:
            return "bool";
        case CallSpec::ParameterTypeFlag:
            return "flag";
        default:
            return "string";
    }
}

const char* KindWord(MetaObj::MetaType type) {
    switch (type) {
        case MetaObj::MetaType::Int:
            return "int";
        case MetaObj::MetaType::Bool:
            return "bool";
        case MetaObj::MetaType::String:
            return "string";
        case MetaObj::MetaType::Struct:
            return "structure";
        default:
            return "list";
    }
}

Json DescribeValues(const ParameterConstraint& constraint) {
    Json values = Json::array();
    for (const long number : constraint.GetIntEnum()) {
        values.push_back({{"value", number}});
    }
    const auto& descriptions = constraint.GetStringEnumWithDesc();
    for (const std::string& text : constraint.GetStringEnum()) {
        values.push_back({{"value", text}});
        if (const auto found = descriptions.find(text); found != descriptions.end()) {
            values.back()["description"] = found->second;
        }
    }
    return values;
}

Json Describe(const ParameterConstraint& constraint) {
    Json description = {{"words", constraint.ToString()}};
    long minimum = 0;
    long maximum = 0;
    switch (constraint.GetType()) {
        case CallSpec::ConstraintTypeIntRange:
            constraint.GetIntRange(minimum, maximum);
            description["minimum"] = minimum;
            description["maximum"] = maximum;
            break;
        case CallSpec::ConstraintTypeIntEnum:
        case CallSpec::ConstraintTypeStringEnum:
            description["values"] = DescribeValues(constraint);
            break;
        case CallSpec::ConstraintTypeStringRegex:
            description["expression"] = constraint.GetStringRegex();
            break;
        case CallSpec::ConstraintTypeNone:
            break;
    }
    return description;
}

// Members stand in a list of their own.
std::string DescriptionOf(const ParameterSpec& parameter) {
    constexpr std::string_view members = "%FULLENUM%";
    std::string text = parameter.GetDescription(false);
    const size_t at = text.find(members);
    return at == std::string::npos ? parameter.GetDescription(true)
                                   : text.erase(at, members.size());
}

// Empty where the engine would say that there is none.
std::string DescriptionOf(const CallSpec::OutputSpec& output) {
    const std::string& text = output.GetDescription();
    return text == CallSpec::OutputSpec::New()->GetDescription() ? "" : text;
}

Json Describe(const ParameterSpec& parameter) {
    Json description = {{"name", parameter.GetName()}};
    if (!parameter.GetShortName().empty()) {
        description["shortName"] = parameter.GetShortName();
    }
    description["kind"] = KindWord(parameter.GetParameterType());
    description["required"] = parameter.IsRequired();
    description["repeated"] = parameter.AllowMultiple();
    description["secret"] = parameter.IsSecret();
    description["description"] = DescriptionOf(parameter);
    if (const auto constraint = parameter.GetConstraint()) {
        description["constraint"] = Describe(*constraint);
    }
    return description;
}

Json DescribeShape(const MetaObject* prototype, const AutoCli::FormatParameters& format);

Json DescribeFields(const MetaStruct& structure, const AutoCli::FormatParameters& format) {
    Json fields = Json::array();
    for (const auto& [name, field] : structure.GetFields()) {
        Json description = {{"name", name}};
        if (!field.documentation.empty()) {
            description["description"] = field.documentation;
        }
        const std::string units = "units:" + structure.GetTypeName() + "." + name;
        if (format.HasParameter(units)) {
            description["units"] = format.GetParameter(units);
        }
        description["shape"] = DescribeShape(field.value.get(), format);
        fields.push_back(std::move(description));
    }
    return fields;
}

Json DescribeShape(const MetaObject* prototype, const AutoCli::FormatParameters& format) {
    if (!prototype) {
        return {{"kind", "any"}};
    }
    Json shape = {{"kind", KindWord(prototype->GetType())}};
    if (const auto* structure = MetaCast<MetaStruct>(prototype)) {
        shape["type"] = structure->GetTypeName();
        shape["fields"] = DescribeFields(*structure, format);
    } else if (const auto* list = MetaCast<MetaList>(prototype)) {
        const MetaObject* item = list->GetListStructure().get();
        shape["items"] =
            item ? DescribeShape(item, format) : Json({{"kind", KindWord(list->GetListType())}});
    }
    return shape;
}

// Those of the declaration, and those of the meta-data: arguments, " : ", and a sentence.
Json DescribeExamples(const Command& command) {
    Json examples = Json::array();
    const auto add = [&examples](const std::string& arguments, const std::string& sentence) {
        examples.push_back({{"arguments", arguments}, {"description", sentence}});
    };
    for (const auto& [arguments, sentence] : command.GetExamples()) {
        add(arguments, sentence);
    }
    for (const auto& [name, text] : command.GetMetaData()) {
        constexpr std::string_view separator = " : ";
        const size_t at = std::min(text.find(separator), text.size());
        if (name == "example") {
            add(text.substr(0, at), text.substr(std::min(at + separator.size(), text.size())));
        }
    }
    return examples;
}

Json Describe(Command& command) {
    Json parameters = Json::array();
    for (const auto& parameter : command.GetInputSpec()->GetParameterSpecs()) {
        if (parameter->GetName() != "help") {
            parameters.push_back(Describe(*parameter));
        }
    }
    const auto output = command.GetOutputSpec();
    const auto format = command.GetDefaultOutputFormatParameters();
    Json description;
    description["path"] = command.GetPath();
    description["description"] = command.GetDescription();
    description["readOnly"] = command.IsReadOnly();
    description["parameters"] = std::move(parameters);
    description["result"]["description"] = DescriptionOf(*output);
    description["result"]["shape"] = DescribeShape(output->GetRootObject().get(), format);
    description["format"]["formatter"] = format.GetFormatter();
    description["format"]["parameters"] = format.GetParameters();
    description["examples"] = DescribeExamples(command);
    return description;
}

class Walk {
public:
    explicit Walk(const std::function<void(const std::string&)>& leftOut) : _leftOut(leftOut) {}

    void Visit(NamespaceNode& node) {
        if (auto* command = dynamic_cast<Command*>(&node)) {
            Add(*command);
            return;
        }
        if (node.GetType() == AutoCli::NodeTypeNamespace) {
            _namespaces.push_back(
                {{"path", node.GetPath()}, {"description", node.GetDescription()}});
        }
        auto children = node.GetNamespaceNodes();
        std::ranges::stable_partition(children, [](const auto& child) {
            return child->GetType() == AutoCli::NodeTypeCommand;
        });
        for (const auto& child : children) {
            Visit(*child);
        }
    }

    Json Take() {
        Json reference;
        reference["version"] = 1;
        reference["namespaces"] = std::move(_namespaces);
        reference["commands"] = std::move(_commands);
        // Texts of shared objects can be anything.
        return Json::parse(reference.dump(-1, ' ', false, Json::error_handler_t::replace));
    }

private:
    void Add(Command& command) {
        try {
            _commands.push_back(Describe(command));
        } catch (const std::exception& error) {
            _leftOut(command.GetPathString(' ') + ": " + error.what());
        }
    }

    const std::function<void(const std::string&)>& _leftOut;
    Json _namespaces = Json::array();
    Json _commands = Json::array();
};

}  // namespace

Json MakeReference(NamespaceNode& node, const std::function<void(const std::string&)>& leftOut) {
    Walk walk(leftOut);
    walk.Visit(node);
    return walk.Take();
}

}  // namespace Author
