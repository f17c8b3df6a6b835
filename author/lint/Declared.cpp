#include <author/lint/Declared.h>

#include <algorithm>

namespace Author {

namespace {

using AutoCli::ExtensionCommand;
using CallSpec::ParameterSpec;
using Zelmar::ZelmarException;

const xmlChar* Chars(const char* text) {
    return reinterpret_cast<const xmlChar*>(text);
}

struct NodeDeleter {
    void operator()(xmlNode* node) const { xmlFreeNode(node); }
};
using NodeCopy = std::unique_ptr<xmlNode, NodeDeleter>;

// The command at a path that always exists.
NodeCopy CopyCommand(const xmlNode* node) {
    NodeCopy copy(xmlDocCopyNode(const_cast<xmlNode*>(node), node->doc, 1));
    xmlSetProp(copy.get(), Chars("path"), Chars("checked"));
    return copy;
}

void RemoveChildren(const xmlNode* node, const char* name, const xmlNode* kept = nullptr) {
    for (const xmlNode* child : Children(node, name)) {
        if (child != kept) {
            xmlUnlinkNode(const_cast<xmlNode*>(child));
            xmlFreeNode(const_cast<xmlNode*>(child));
        }
    }
}

// The command as the engine reads it, or what it has against it, without the path.
struct Loaded {
    std::shared_ptr<ExtensionCommand> command;
    std::string refusal;
};

Loaded Load(const xmlNode* node) {
    try {
        auto plugin = AutoCli::XmlPlugin::New("descriptor");
        plugin->AddCommand(node);
        auto root = AutoCli::Namespace::New();
        plugin->RegisterNamespaces(root);
        return {std::dynamic_pointer_cast<ExtensionCommand>(root->GetNamespaceNode("checked")), ""};
    } catch (const ZelmarException& error) {
        constexpr std::string_view mark = "'  Error was ";
        const std::string text = error.what();
        const size_t place = text.find(mark);
        return {nullptr, place == std::string::npos ? text : text.substr(place + mark.size())};
    }
}

// Is anything wrong but the parameters?
bool IsRefusedWithoutParameters(const xmlNode* node) {
    const NodeCopy bare = CopyCommand(node);
    RemoveChildren(Child(bare.get(), "input-spec"), "parameter");
    return !Load(bare.get()).command;
}

// Each parameter alone; those that are refused lose their constraints in the copy.
void JudgeParameters(const xmlNode* node, xmlNode* copy, Report& report,
                     std::vector<std::string>& refused) {
    const auto parameters = Children(Child(node, "input-spec"), "parameter");
    const auto copies = Children(Child(copy, "input-spec"), "parameter");
    for (size_t i = 0; i < parameters.size(); ++i) {
        const NodeCopy alone = CopyCommand(node);
        const xmlNode* input = Child(alone.get(), "input-spec");
        RemoveChildren(input, "parameter", Children(input, "parameter")[i]);
        const Loaded loaded = Load(alone.get());
        if (loaded.command) {
            continue;
        }
        if (!report.HasErrorIn(parameters[i])) {
            report.AddError(parameters[i], "load", loaded.refusal);
        }
        RemoveChildren(copies[i], "constraint");
        refused.push_back(Attribute(parameters[i], "name"));
    }
}

CharacterSet CharactersOf(const std::vector<std::string>& values) {
    CharacterSet characters;
    for (const std::string& value : values) {
        for (const char c : value) {
            characters.set(static_cast<unsigned char>(c));
        }
    }
    return characters;
}

void FillCharacters(DeclaredParameter& parameter) {
    const auto constraint = parameter.spec->GetConstraint();
    const int type = parameter.spec->GetType();
    parameter.hasConstraint = constraint != nullptr;
    if (type != CallSpec::ParameterTypeString && type != CallSpec::ParameterTypeStringList) {
        // Blanks in front of a number are lost with the word's borders.
        parameter.characters = CharactersOf({"0123456789+-", "yntfTFTrueFalse"});
    } else if (!constraint) {
        parameter.characters.set();
    } else if (constraint->GetType() == CallSpec::ConstraintTypeStringEnum) {
        parameter.characters = CharactersOf(constraint->GetStringEnum());
    } else {
        const Expression expression = ReadExpression(constraint->GetStringRegex());
        parameter.characters = expression.characters;
        parameter.hasLookaround = expression.hasLookaround;
    }
    parameter.characters.reset('\0');  // no argument can hold it
}

std::vector<DeclaredParameter> ReadParameters(const xmlNode* node, ExtensionCommand& command,
                                              const std::vector<std::string>& refused) {
    std::vector<DeclaredParameter> parameters;
    const auto nodes = Children(Child(node, "input-spec"), "parameter");
    for (const auto& spec : command.GetInputSpecInternal()->GetParameterSpecs()) {
        const auto place = std::ranges::find_if(nodes, [&spec](const xmlNode* parameter) {
            return Attribute(parameter, "name") == spec->GetName();
        });
        if (place == nodes.end()) {
            continue;
        }
        parameters.push_back({*place, spec, {}});
        if (std::ranges::find(refused, spec->GetName()) == refused.end()) {
            FillCharacters(parameters.back());
        }
    }
    return parameters;
}

}  // namespace

const DeclaredParameter* DeclaredCommand::Find(const std::string& name) const {
    const auto found = std::ranges::find_if(
        parameters,
        [&name](const DeclaredParameter& parameter) { return parameter.spec->GetName() == name; });
    return found == parameters.end() ? nullptr : &*found;
}

std::vector<std::string> DeclaredCommand::ParameterNames() const {
    std::vector<std::string> names;
    names.reserve(parameters.size());
    for (const DeclaredParameter& parameter : parameters) {
        names.push_back(parameter.spec->GetName());
    }
    return names;
}

std::optional<DeclaredCommand> ReadCommand(const xmlNode* node, Report& report) {
    const NodeCopy copy = CopyCommand(node);
    std::vector<std::string> refused;
    Loaded loaded = Load(copy.get());
    if (!loaded.command && !IsRefusedWithoutParameters(node)) {
        JudgeParameters(node, copy.get(), report, refused);
        loaded = Load(copy.get());
    }
    if (!loaded.command) {
        if (!report.HasErrorIn(node)) {
            report.AddError(node, "load", loaded.refusal);
        }
        return std::nullopt;
    }
    try {
        loaded.command->GetInputSpec();
    } catch (const ZelmarException& error) {
        // A parameter that is named like the help. The engine goes on without help from here.
        if (!report.HasErrorIn(node)) {
            report.AddError(node, "load", error.what());
        }
    }
    DeclaredCommand declared{node, loaded.command, {}};
    declared.parameters = ReadParameters(node, *declared.command, refused);
    return declared;
}

bool Accepts(const ParameterSpec& parameter, const std::string& value) {
    return parameter.Validate({value}, CallSpec::Output::New());
}

}  // namespace Author
