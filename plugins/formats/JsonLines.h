#pragma once

#include <zelmar/zelmar.h>

/// "jsonl": JSON (RFC 8259) as `AutoCli_WriteJsonText` writes it, a line for each item of a list,
/// else one line: jsonlines.org. With the parameter `whole` = "true" a list is one line as well.
/// All fields are there, without units.
class JsonLinesFormatter : public AutoCli::Formatter {
public:
    JsonLinesFormatter();
    bool Format(const std::shared_ptr<CallSpec::Output>& output,
                AutoCli::FormatParameters& parameters, AutoCli::DisplayContext& context,
                std::ostream& stream) override;
};
