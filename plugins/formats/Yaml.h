#pragma once

#include <zelmar/zelmar.h>

/// "yaml": the whole value as one document that readers of YAML 1.1 and 1.2 take for that value,
/// without units. A text that they could take for anything but itself stands in double quotes. In
/// texts U+FFFD stands for bytes that are no UTF-8.
class YamlFormatter : public AutoCli::Formatter {
public:
    YamlFormatter();
    /// Throws `ZelmarException`, before anything is written: "Error: YAML cannot carry a text that
    /// holds a NUL character".
    bool Format(const std::shared_ptr<CallSpec::Output>& output,
                AutoCli::FormatParameters& parameters, AutoCli::DisplayContext& context,
                std::ostream& stream) override;
};
