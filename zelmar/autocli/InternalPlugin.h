#pragma once

#include <zelmar/autocli/Plugin.h>

#include <memory>
#include <string>
#include <vector>

namespace AutoCli {

/// The plugin that every dispatcher makes for itself, named "Internal": all the formatters, and the
/// command `kelvash command list`.
class ZELMAR_EXPORT InternalPlugin : public Plugin {
public:
    ~InternalPlugin() override;

    /// Without formatters until `Initialize`.
    static std::shared_ptr<InternalPlugin> New();

    void Initialize() override;
    [[nodiscard]] const std::string& GetName() const override;
    void RegisterNamespaces(std::shared_ptr<Namespace> root) override;
    bool HasFormatter(const std::string& name) override;
    std::shared_ptr<Formatter> GetFormatter(const std::string& name) override;
    const std::vector<std::shared_ptr<Formatter>>& GetFormatters() override;

private:
    std::vector<std::shared_ptr<Formatter>> _formatters;
};

}  // namespace AutoCli
