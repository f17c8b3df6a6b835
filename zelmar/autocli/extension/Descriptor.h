#pragma once

#include <zelmar/autocli/CommandSpec.h>
#include <zelmar/autocli/extension/XmlReader.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

// Readers of the parts of a <command> element of a descriptor. Elements that have no meaning at
// their place are passed over, except where a comment says otherwise. Everything that is wrong
// throws `ZelmarException`.

namespace AutoCli {

/// Keeps the entries with the command, for others than the engine. An unknown element is an error.
void ExtractMetaData(const XmlNode& node, CommandSpec& command);

void ExtractFormatParams(const XmlNode& node, CommandSpec& command);

[[nodiscard]] std::shared_ptr<CallSpec::InputSpec> ExtractInputSpec(const XmlNode& node);
void ExtractInputParam(const XmlNode& node, CallSpec::InputSpec& inputSpec);

/// Of several data elements that fit the constraint's type the last one holds.
[[nodiscard]] std::shared_ptr<CallSpec::ParameterConstraint> ExtractParamConstraint(
    const XmlNode& node);

/// Value and description of each entry, in the order of the file; one without text counts for
/// nothing. An unknown element is an error.
[[nodiscard]] std::vector<std::pair<std::string, std::string>> ExtractEnum(const XmlNode& node);

/// Without a root object when the element holds no value. Any element stands for one.
[[nodiscard]] std::shared_ptr<CallSpec::OutputSpec> ExtractOutputSpec(const XmlNode& node);

}  // namespace AutoCli
