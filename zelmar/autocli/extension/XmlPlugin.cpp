#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/Descriptor.h>
#include <zelmar/autocli/extension/ExtensionCommand.h>
#include <zelmar/autocli/extension/Rethrow.h>
#include <zelmar/autocli/extension/XmlPlugin.h>
#include <zelmar/autocli/extension/XmlTree.h>
#include <zelmar/autocli/extension/XmlUtil.h>
#include <zelmar/internal/Split.h>

using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

const XmlNode& RequireChild(const XmlNode& node, std::string_view tag) {
    const XmlNode* child = XmlUtil_FindChildNode(node, tag);
    if (!child) {
        throw ZelmarException("Unable to find <" + std::string(tag) +
                              "> element, which is required for a command.");
    }
    return *child;
}

std::shared_ptr<ExtensionCommand> ReadCommandNode(const XmlNode& node,
                                                  std::string_view description) {
    auto command = ExtensionCommand::New();
    command->SetDescription(std::string(description));
    if (const XmlNode* metaData = XmlUtil_FindChildNode(node, "meta-data")) {
        ExtractMetaData(*metaData, *command);
    }
    command->SetInputSpec(ExtractInputSpec(RequireChild(node, "input-spec")));
    command->SetOutputSpec(ExtractOutputSpec(RequireChild(node, "output-spec")));
    ExtractFormatParams(RequireChild(node, "format-parameters"), *command);

    const std::string_view execute = XmlUtil_GetContentForChildByTag(node, "execute");
    if (execute.empty()) {
        throw ZelmarException(
            "Missing or empty <execute> tag.  This tag must specify a valid execution string for"
            " this command.");
    }
    command->SetExecuteCommand(std::string(execute));
    command->SetStdin(std::string(XmlUtil_GetContentForChildByTag(node, "stdin")));
    return command;
}

using Registration = std::pair<std::string, std::shared_ptr<NamespaceNode>>;

Registration ReadNamespace(const XmlNode& node) {
    const std::string_view path = XmlUtil_ExtractAttribute(node, "path");
    const std::string_view description = XmlUtil_GetContentForChildByTag(node, "description");
    if (path.empty() || description.empty()) {
        throw ZelmarException(
            "Unable to register a namespace without valid 'path' attribute or <description> being"
            " present.");
    }
    auto created = Namespace::New();
    created->SetDescription(std::string(description));
    return {std::string(path), std::move(created)};
}

Registration ReadCommand(const XmlNode& node) {
    const std::string path(XmlUtil_ExtractAttribute(node, "path"));
    if (path.empty()) {
        throw ZelmarException(
            "Invalid command specification found.  <command> tags must have a non-empty 'path'"
            " attribute");
    }
    const std::string_view description = XmlUtil_GetContentForChildByTag(node, "description");
    return {path, WithContext("Unable to register the command 'kelvash " + path + "'  Error was ",
                              [&] { return ReadCommandNode(node, description); })};
}

// The parents of entries, which mostly follow each other: the last answer is kept.
class Parents {
public:
    explicit Parents(const std::shared_ptr<Namespace>& root) : _root(root), _parent(root) {}

    // Throws what `ResolveNode` does; asked for the same once more, answers null.
    const std::shared_ptr<NamespaceNode>& Find(std::list<std::string> names) {
        if (names != _names) {
            _names = names;
            _parent = nullptr;
            _parent = names.empty() ? _root : _root->ResolveNode(names);
        }
        return _parent;
    }

private:
    std::shared_ptr<Namespace> _root;
    std::list<std::string> _names;
    std::shared_ptr<NamespaceNode> _parent;
};

// Null where an entry before this one may be about to create the parent.
std::shared_ptr<NamespaceNode> FindIfAny(Parents& parents, const std::list<std::string>& names) {
    try {
        return parents.Find(names);
    } catch (const ZelmarException&) {
        return nullptr;
    }
}

// The name at the end of a path, which is taken off.
std::string TakeName(std::list<std::string>& names) {
    std::string name = std::move(names.back());
    names.pop_back();
    return name;
}

void AddAll(const XmlNode& node, std::string_view tag, Registration (*read)(const XmlNode&),
            std::vector<Registration>& registrations) {
    for (const XmlNode& child : node) {
        if (child.name == tag) {
            registrations.push_back(read(child));
        }
    }
}

bool AreTopLevelNamespaces(NamespaceNode& parent, NamespaceNode& one, NamespaceNode& other) {
    return parent.GetType() == NodeTypeRoot && one.GetType() == NodeTypeNamespace &&
           other.GetType() == NodeTypeNamespace;
}

void RequireFree(Parents& parents, const Registration& registration) {
    const auto& [path, node] = registration;
    auto names = XmlPlugin::SplitPath(path);
    const std::string name = TakeName(names);
    const auto parent = FindIfAny(parents, names);
    const auto existing = parent ? parent->GetNamespaceNode(name) : nullptr;
    if (!existing) {
        return;
    }
    if (!AreTopLevelNamespaces(*parent, *existing, *node)) {
        throw ZelmarException("Kelvash path is already registered: " + path);
    }
    if (existing->GetDescription() != node->GetDescription()) {
        throw ZelmarException("Duplicate top-level namespaces must have the same description: " +
                              path);
    }
}

void Register(Parents& parents, const Registration& registration) {
    const auto& [path, node] = registration;
    auto names = XmlPlugin::SplitPath(path);
    const std::string name = TakeName(names);
    const auto parent = parents.Find(names);
    const auto existing = parent->GetNamespaceNode(name);
    const bool isShared = existing && AreTopLevelNamespaces(*parent, *existing, *node) &&
                          existing->GetDescription() == node->GetDescription();
    if (!isShared) {
        parent->RegisterNamespaceNode(node, name);
    }
}

}  // namespace

XmlPlugin::~XmlPlugin() = default;

std::shared_ptr<XmlPlugin> XmlPlugin::New(const std::string& path) {
    return std::make_shared<XmlPlugin>(path);
}

void XmlPlugin::Initialize() {
    WithContext("Unable to handle XML Plugin " + _path + ".  There was an error while parsing: ",
                [this] { ReadFile(); });
}

void XmlPlugin::ReadFile() {
    XmlTree tree;
    if (!XmlUtil_ReadFile(_path, tree) || !tree.GetRoot()) {
        throw ZelmarException("Unable to parse XML descriptor: " + _path);
    }
    const XmlNode& root = *tree.GetRoot();
    if (XmlUtil_GetContentForChildByTag(root, "version") != "1.0.0") {
        throw ZelmarException("Unknown kelvash extention version.  Valid versions are: '1.0.0'");
    }
    const XmlNode* namespaces = XmlUtil_FindChildNode(root, "namespaces");
    if (namespaces) {
        AddAll(*namespaces, "namespace", ReadNamespace, _registrations);
    }
    const XmlNode* commands = XmlUtil_FindChildNode(root, "commands");
    if (commands) {
        AddAll(*commands, "command", ReadCommand, _registrations);
    }
    if (!namespaces && !commands) {
        throw ZelmarException("Unable to find any namespaces or commands to register for plugin " +
                              _path);
    }
}

void XmlPlugin::AddNamespaces(const _xmlNode* node) {
    const XmlTree tree(node);
    AddAll(*tree.GetRoot(), "namespace", ReadNamespace, _registrations);
}

void XmlPlugin::AddNamespace(const _xmlNode* node) {
    const XmlTree tree(node);
    _registrations.push_back(ReadNamespace(*tree.GetRoot()));
}

void XmlPlugin::AddCommands(const _xmlNode* node) {
    const XmlTree tree(node);
    AddAll(*tree.GetRoot(), "command", ReadCommand, _registrations);
}

void XmlPlugin::AddCommand(const _xmlNode* node) {
    const XmlTree tree(node);
    _registrations.push_back(ReadCommand(*tree.GetRoot()));
}

std::list<std::string> XmlPlugin::SplitPath(const std::string& path) {
    std::list<std::string> names;
    ForEachPiece(path, '.', [&names](std::string_view name) { names.emplace_back(name); });
    return names;
}

// First a look at all entries, so that a name which is taken leaves the tree as it was.
void XmlPlugin::RegisterNamespaces(std::shared_ptr<Namespace> root) {
    Parents parents(root);
    for (const Registration& registration : _registrations) {
        const auto& [path, node] = registration;
        if (path.empty()) {
            throw ZelmarException("Invalid NULL registration found in XML plugin: " + _path +
                                  " all namespaces and commands must have a valid 'path' field");
        }
        if (!node) {
            throw ZelmarException("Invalid null node: " + path);
        }
        RequireFree(parents, registration);
    }
    Parents found(root);
    for (const Registration& registration : _registrations) {
        Register(found, registration);
    }
}

bool XmlPlugin::HasFormatter(const std::string& /*name*/) {
    return false;
}

std::shared_ptr<Formatter> XmlPlugin::GetFormatter(const std::string& /*name*/) {
    throw ZelmarException("Xml Plugin doesn't not support formatters");
}

const std::vector<std::shared_ptr<Formatter>>& XmlPlugin::GetFormatters() {
    static const std::vector<std::shared_ptr<Formatter>> none;
    return none;
}

}  // namespace AutoCli
