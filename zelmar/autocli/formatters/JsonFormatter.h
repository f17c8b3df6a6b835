#pragma once

#include <zelmar/autocli/formatters/Formatter.h>

namespace AutoCli {

/// "json": the value as JSON, for programs. It reads no parameters.
///
/// Each byte of a text is written by itself, those from 0x7F on as `\u00xx`: text is not decoded.
/// Names of fields are not escaped. Only memory bounds how deep values are nested.
class ZELMAR_EXPORT JsonFormatter : public Formatter {
public:
    JsonFormatter();

    bool Format(const std::shared_ptr<CallSpec::Output>& output, FormatParameters& parameters,
                DisplayContext& context, std::ostream& stream) override;

    /// Writes one value, scalars without a line end. A struct or list starts with a line end and
    /// is indented by three blanks for each level above 0. A null value, and one of no known kind,
    /// gives the line "Unknown data type".
    void Format(const std::shared_ptr<MetaObj::MetaObject>& value, std::ostream& stream,
                int level) const;
};

}  // namespace AutoCli
