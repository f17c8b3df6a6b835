#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/Descriptor.h>
#include <zelmar/autocli/extension/ExtensionCommand.h>
#include <zelmar/autocli/extension/Rethrow.h>
#include <zelmar/autocli/extension/XmlPlugin.h>
#include <zelmar/internal/Split.h>

#include <libxml/parser.h>

using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

// libxml2 takes a path such as http://... for an address to fetch.
std::string AsLocalPath(const std::string& path) {
    return path.find("://") == std::string::npos || path.starts_with('/') ? path : "./" + path;
}

XmlDocument ReadDocument(const std::string& path) {
    LIBXML_TEST_VERSION
    XmlDocument document(xmlReadFile(AsLocalPath(path).c_str(), nullptr, 0));
    if (!document) {
        throw ZelmarException("Unable to parse XML descriptor: " + path);
    }
    XmlUtil_CheckDeclarations(document.get());
    return document;
}

const xmlNode* RequireChild(const xmlNode* node, const std::string& tag) {
    const xmlNode* child = XmlUtil_FindChildNode(node, tag);
    if (!child) {
        throw ZelmarException("Unable to find <" + tag +
                              "> element, which is required for a command.");
    }
    return child;
}

std::shared_ptr<ExtensionCommand> ReadCommand(const xmlNode* node, const std::string& description) {
    auto command = ExtensionCommand::New();
    command->SetDescription(description);
    if (const xmlNode* metaData = XmlUtil_FindChildNode(node, "meta-data")) {
        ExtractMetaData(metaData, *command);
    }
    command->SetInputSpec(ExtractInputSpec(RequireChild(node, "input-spec")));
    command->SetOutputSpec(ExtractOutputSpec(RequireChild(node, "output-spec")));
    ExtractFormatParams(RequireChild(node, "format-parameters"), *command);

    const std::string execute = XmlUtil_GetContentForChildByTag(node, "execute");
    if (execute.empty()) {
        throw ZelmarException(
            "Missing or empty <execute> tag.  This tag must specify a valid execution string for"
            " this command.");
    }
    command->SetExecuteCommand(execute);
    command->SetStdin(XmlUtil_GetContentForChildByTag(node, "stdin"));
    return command;
}

// Null when there is no such node yet. That is the rule and no failure, so it should not cost one.
std::shared_ptr<NamespaceNode> FindNode(std::shared_ptr<NamespaceNode> node,
                                        const std::list<std::string>& path) {
    for (const std::string& name : path) {
        if (!node->HasNamespaceNode(name)) {
            return nullptr;
        }
        node = node->GetNamespaceNode(name);
    }
    return node;
}

bool AreTopLevelNamespaces(NamespaceNode& parent, NamespaceNode& one, NamespaceNode& other) {
    return parent.GetType() == NodeTypeRoot && one.GetType() == NodeTypeNamespace &&
           other.GetType() == NodeTypeNamespace;
}

}  // namespace

XmlPlugin::~XmlPlugin() = default;

std::shared_ptr<XmlPlugin> XmlPlugin::New(const std::string& path) {
    return std::make_shared<XmlPlugin>(path);
}

void XmlPlugin::Initialize() {
    WithContext(
        [this] {
            return "Unable to handle XML Plugin " + _path + ".  There was an error while parsing: ";
        },
        [this] { ReadFile(); });
}

void XmlPlugin::ReadFile() {
    const XmlDocument document = ReadDocument(_path);
    const xmlNode* root = xmlDocGetRootElement(document.get());
    if (XmlUtil_GetContentForChildByTag(root, "version") != "1.0.0") {
        throw ZelmarException("Unknown kelvash extention version.  Valid versions are: '1.0.0'");
    }
    const xmlNode* namespaces = XmlUtil_FindChildNode(root, "namespaces");
    if (namespaces) {
        AddNamespaces(namespaces);
    }
    const xmlNode* commands = XmlUtil_FindChildNode(root, "commands");
    if (commands) {
        AddCommands(commands);
    }
    if (!namespaces && !commands) {
        throw ZelmarException("Unable to find any namespaces or commands to register for plugin " +
                              _path);
    }
}

void XmlPlugin::AddNamespaces(const _xmlNode* node) {
    XmlUtil_ForEachChild(node, "namespace", [this](const xmlNode* child) { AddNamespace(child); });
}

void XmlPlugin::AddNamespace(const _xmlNode* node) {
    const std::string path = XmlUtil_ExtractAttribute(node, "path");
    const std::string description = XmlUtil_GetContentForChildByTag(node, "description");
    if (path.empty() || description.empty()) {
        throw ZelmarException(
            "Unable to register a namespace without valid 'path' attribute or <description> being"
            " present.");
    }
    auto created = Namespace::New();
    created->SetDescription(description);
    _registrations.emplace_back(path, created);
}

void XmlPlugin::AddCommands(const _xmlNode* node) {
    XmlUtil_ForEachChild(node, "command", [this](const xmlNode* child) { AddCommand(child); });
}

void XmlPlugin::AddCommand(const _xmlNode* node) {
    const std::string path = XmlUtil_ExtractAttribute(node, "path");
    if (path.empty()) {
        throw ZelmarException(
            "Invalid command specification found.  <command> tags must have a non-empty 'path'"
            " attribute");
    }
    const std::string description = XmlUtil_GetContentForChildByTag(node, "description");
    auto command = WithContext(
        [&path] { return "Unable to register the command 'kelvash " + path + "'  Error was "; },
        [&] { return ReadCommand(node, description); });
    _registrations.emplace_back(path, std::move(command));
}

std::list<std::string> XmlPlugin::SplitPath(const std::string& path) {
    std::list<std::string> names;
    ForEachPiece(path, '.', [&names](std::string_view name) { names.emplace_back(name); });
    return names;
}

// First a look at all entries, so that a name which is taken leaves the tree as it was.
void XmlPlugin::RegisterNamespaces(std::shared_ptr<Namespace> root) {
    for (const Registration& registration : _registrations) {
        RequireFree(root, registration);
    }
    for (const Registration& registration : _registrations) {
        Register(root, registration);
    }
}

void XmlPlugin::RequireFree(const std::shared_ptr<Namespace>& root,
                            const Registration& registration) {
    const auto& [path, node] = registration;
    if (path.empty()) {
        throw ZelmarException("Invalid NULL registration found in XML plugin: " + _path +
                              " all namespaces and commands must have a valid 'path' field");
    }
    if (!node) {
        throw ZelmarException("Invalid null node: " + path);
    }
    auto names = SplitPath(path);
    const std::string name = std::move(names.back());
    names.pop_back();
    // An entry before this one may be about to create the parent.
    const auto parent = FindNode(root, names);
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

void XmlPlugin::Register(const std::shared_ptr<Namespace>& root, const Registration& registration) {
    const auto& [path, node] = registration;
    auto names = SplitPath(path);
    const std::string name = std::move(names.back());
    names.pop_back();
    const auto parent = names.empty() ? root : root->ResolveNode(names);
    const auto existing = parent->GetNamespaceNode(name);
    const bool isShared = existing && AreTopLevelNamespaces(*parent, *existing, *node) &&
                          existing->GetDescription() == node->GetDescription();
    if (!isShared) {
        parent->RegisterNamespaceNode(node, name);
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
