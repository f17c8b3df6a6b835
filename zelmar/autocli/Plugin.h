#pragma once

#include <zelmar/Export.h>
#include <zelmar/autocli/Namespace.h>
#include <zelmar/autocli/formatters/Formatter.h>

#include <memory>
#include <string>
#include <vector>

namespace AutoCli {

/// A source of commands and formatters. The dispatcher calls `Initialize` and then, once,
/// `RegisterNamespaces`, and reads the formatters after that.
class ZELMAR_EXPORT Plugin {
public:
    virtual ~Plugin();

    /// Acquires what the plugin needs and touches no tree. May throw `ZelmarException`.
    virtual void Initialize() = 0;
    /// The name in messages and in `Dispatcher::GetPluginNames`.
    [[nodiscard]] virtual const std::string& GetName() const = 0;
    /// Adds its nodes below the given root. May throw `ZelmarException`; the nodes that were added
    /// before stay.
    virtual void RegisterNamespaces(std::shared_ptr<Namespace> root) = 0;

    virtual bool HasFormatter(const std::string& name) = 0;
    /// Null when there is none of that name.
    virtual std::shared_ptr<Formatter> GetFormatter(const std::string& name) = 0;
    virtual const std::vector<std::shared_ptr<Formatter>>& GetFormatters() = 0;
};

}  // namespace AutoCli
