#pragma once

#include <author/lint/Expression.h>
#include <author/lint/Report.h>
#include <zelmar/zelmar.h>

#include <optional>

namespace Author {

struct DeclaredParameter {
    const xmlNode* node;
    std::shared_ptr<CallSpec::ParameterSpec> spec;
    CharacterSet characters;  ///< that a value which passes the checks can hold
    bool hasLookaround = false;
    bool hasConstraint = false;
};

/// A command as the engine has read it, and where its parts stand in the file.
struct DeclaredCommand {
    const xmlNode* node;
    std::shared_ptr<AutoCli::ExtensionCommand> command;
    std::vector<DeclaredParameter> parameters;  ///< by name, without help

    [[nodiscard]] const DeclaredParameter* Find(const std::string& name) const;
    [[nodiscard]] std::vector<std::string> ParameterNames() const;
};

/// Lets the engine read the command. What it refuses is reported, each parameter on its own, unless
/// an error stands there already; none when nothing can be read.
std::optional<DeclaredCommand> ReadCommand(const xmlNode* node, Report& report);

/// Does the parameter take this single value?
bool Accepts(const CallSpec::ParameterSpec& parameter, const std::string& value);

}  // namespace Author
