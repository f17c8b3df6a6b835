// More formats for every command. A plugin that brings formatters is a `Plugin` of its own, which
// it registers with the dispatcher when the engine hands it the tree.

#include <zelmar/zelmar.h>

#include "Delimited.h"
#include "Html.h"
#include "JsonLines.h"
#include "Markdown.h"
#include "Yaml.h"

namespace {

class Formats : public AutoCli::Plugin {
public:
    void Initialize() override {
        _formatters = {
            std::make_shared<CsvFormatter>(),       std::make_shared<HtmlFormatter>(),
            std::make_shared<JsonLinesFormatter>(), std::make_shared<MarkdownFormatter>(),
            std::make_shared<TsvFormatter>(),       std::make_shared<YamlFormatter>()};
    }
    [[nodiscard]] const std::string& GetName() const override { return _name; }
    void RegisterNamespaces(std::shared_ptr<AutoCli::Namespace> /*root*/) override {}

    bool HasFormatter(const std::string& name) override { return GetFormatter(name) != nullptr; }
    std::shared_ptr<AutoCli::Formatter> GetFormatter(const std::string& name) override {
        for (const auto& formatter : _formatters) {
            if (formatter->GetName() == name) {
                return formatter;
            }
        }
        return nullptr;
    }
    const std::vector<std::shared_ptr<AutoCli::Formatter>>& GetFormatters() override {
        return _formatters;
    }

private:
    const std::string _name = "Formats";
    std::vector<std::shared_ptr<AutoCli::Formatter>> _formatters;
};

}  // namespace

extern "C" ZELMAR_EXPORT void AutoCli_RegisterNamespaces(std::shared_ptr<AutoCli::Namespace> root) {
    const auto formats = std::make_shared<Formats>();
    formats->Initialize();
    root->GetDispatcher()->RegisterPlugin(formats);
}
