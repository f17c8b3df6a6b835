#pragma once

#include <zelmar/autocli/Plugin.h>

#include <list>
#include <memory>
#include <string>
#include <utility>
#include <vector>

struct _xmlNode;  // NOLINT(bugprone-reserved-identifier): the name that libxml2 gives it

namespace AutoCli {

/// The namespaces and commands that one descriptor file declares. It has no formatters.
class ZELMAR_EXPORT XmlPlugin : public Plugin {
public:
    explicit XmlPlugin(std::string path) : _path(std::move(path)) {}
    ~XmlPlugin() override;

    /// Reads nothing yet. The path is also the plugin's name.
    static std::shared_ptr<XmlPlugin> New(const std::string& path);

    /// Reads the file. Throws `ZelmarException`: "Unable to handle XML Plugin <path>.  There was an
    /// error while parsing: <what is wrong>". libxml2 tells the details of a file that is not
    /// well-formed on the error stream.
    void Initialize() override;
    [[nodiscard]] const std::string& GetName() const override { return _path; }

    /// A namespace below the root may exist already, with the same description: it is shared. No
    /// other name may be taken, and each parent must exist when its child comes up: all namespaces
    /// of the file come before its commands. What is taken throws `ZelmarException` before anything
    /// is registered; after any other failure what was registered before it stays.
    void RegisterNamespaces(std::shared_ptr<Namespace> root) override;

    bool HasFormatter(const std::string& name) override;
    /// Always throws `ZelmarException`: "Xml Plugin doesn't not support formatters".
    std::shared_ptr<Formatter> GetFormatter(const std::string& name) override;
    const std::vector<std::shared_ptr<Formatter>>& GetFormatters() override;

    /// The steps of `Initialize`, each for one element: what it declares is noted for
    /// `RegisterNamespaces`. The node must be an element, and is not kept.
    void AddNamespaces(const _xmlNode* node);
    void AddNamespace(const _xmlNode* node);
    void AddCommands(const _xmlNode* node);
    void AddCommand(const _xmlNode* node);

    /// The names in a path with dots between them. A dot at the end opens no further one.
    static std::list<std::string> SplitPath(const std::string& path);

private:
    void ReadFile();

    std::string _path;
    std::vector<std::pair<std::string, std::shared_ptr<NamespaceNode>>> _registrations;
};

}  // namespace AutoCli
