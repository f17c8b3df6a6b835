#pragma once

#include <zelmar/zelmar.h>

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "Json.h"

/// Which commands are offered. Without any of this, those that promise to change nothing.
struct Policy {
    std::vector<std::string> allow;  ///< shell patterns on dotted paths: offered as well
    std::vector<std::string> deny;   ///< the same: never offered
    bool allowSecrets = false;       ///< also commands that take a secret
};

/// The commands of a tree as tools. A tool's name is the command's path, joined by underscores,
/// which no name in the tree holds.
class Tools {
public:
    /// The tree must outlive the tools. A command whose declaration throws, or is null, is told on
    /// the error stream and left out.
    Tools(const AutoCli::Dispatcher& dispatcher, const Policy& policy);

    /// Null when no tool of that name is offered.
    [[nodiscard]] std::shared_ptr<AutoCli::Command> Find(const std::string& name) const;

    /// The descriptions of at most `count` tools whose names come behind `after`, by name.
    [[nodiscard]] Json Describe(const std::string& after, size_t count) const;

    /// Is there any tool whose name comes behind this one?
    [[nodiscard]] bool HasMoreBehind(const std::string& name) const;

private:
    void AddBelow(AutoCli::NamespaceNode& node, const Policy& policy);

    std::map<std::string, std::shared_ptr<AutoCli::Command>> _commands;
};
