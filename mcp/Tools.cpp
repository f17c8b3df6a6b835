#include "Tools.h"

#include <fnmatch.h>

#include <algorithm>
#include <iostream>

#include "Schema.h"

namespace {

bool MatchesAny(const std::string& path, const std::vector<std::string>& patterns) {
    return std::ranges::any_of(patterns, [&path](const std::string& pattern) {
        return fnmatch(pattern.c_str(), path.c_str(), 0) == 0;
    });
}

bool TakesSecret(AutoCli::Command& command) {
    return std::ranges::any_of(command.GetInputSpec()->GetParameterSpecs(),
                               [](const auto& parameter) { return parameter->IsSecret(); });
}

// The declarations are built here, once, so that nothing is offered that cannot be called.
bool IsOffered(AutoCli::Command& command, const Policy& policy) {
    const std::string path = command.GetPathString('.');
    if (MatchesAny(path, policy.deny) ||
        !(command.IsReadOnly() || MatchesAny(path, policy.allow))) {
        return false;
    }
    try {
        return (policy.allowSecrets || !TakesSecret(command)) && command.GetOutputSpec();
    } catch (const std::exception& error) {
        std::cerr << "Leaving out " << path << ": " << error.what() << std::endl;
        return false;
    }
}

std::string DescriptionOf(AutoCli::Command& command) {
    std::string text = command.GetDescription();
    for (const auto& [syntax, sentence] : command.GetExamples()) {
        text += "\nExample: " + syntax + " : " + sentence;
    }
    for (const auto& [name, example] : command.GetMetaData()) {
        if (name == "example") {
            text += "\nExample: " + example;
        }
    }
    return text;
}

Json Description(const std::string& name, AutoCli::Command& command) {
    const bool readOnly = command.IsReadOnly();
    return {{"name", name},
            {"title", command.GetPathString(' ')},
            {"description", DescriptionOf(command)},
            {"inputSchema", InputSchema(command)},
            {"outputSchema", OutputSchema(command)},
            {"annotations", {{"readOnlyHint", readOnly}, {"destructiveHint", !readOnly}}}};
}

}  // namespace

Tools::Tools(const AutoCli::Dispatcher& dispatcher, const Policy& policy) {
    AddBelow(*dispatcher.GetRootNamespace(), policy);
}

std::shared_ptr<AutoCli::Command> Tools::Find(const std::string& name) const {
    const auto found = _commands.find(name);
    return found == _commands.end() ? nullptr : found->second;
}

Json Tools::Describe(const std::string& after, size_t count) const {
    Json tools = Json::array();
    for (auto next = _commands.upper_bound(after); next != _commands.end() && tools.size() < count;
         ++next) {
        tools.push_back(Description(next->first, *next->second));
    }
    return tools;
}

bool Tools::HasMoreBehind(const std::string& name) const {
    return _commands.upper_bound(name) != _commands.end();
}

void Tools::AddBelow(AutoCli::NamespaceNode& node, const Policy& policy) {
    for (const auto& child : node.GetNamespaceNodes()) {
        if (const auto command = std::dynamic_pointer_cast<AutoCli::Command>(child)) {
            if (IsOffered(*command, policy)) {
                _commands.emplace(command->GetPathString('_'), command);
            }
        } else {
            AddBelow(*child, policy);
        }
    }
}
