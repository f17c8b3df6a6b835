#pragma once

#include <zelmar/autocli/formatters/Formatter.h>

namespace AutoCli {

/// "python": the value as one Python expression on one line, for `ast.literal_eval` or `eval`. It
/// reads no parameters.
///
/// In a text only the double quote and the line feed are escaped, in names of fields nothing. Only
/// memory bounds how deep values are nested.
class ZELMAR_EXPORT PythonFormatter : public Formatter {
public:
    PythonFormatter();

    bool Format(const std::shared_ptr<CallSpec::Output>& output, FormatParameters& parameters,
                DisplayContext& context, std::ostream& stream) override;

    /// Writes one value, without a line end; nothing depends on the level. Throws
    /// `ZelmarException` for a null value: "Invalid MetaObject passed to Format in
    /// PythonFormatter".
    void Format(const std::shared_ptr<MetaObj::MetaObject>& value, std::ostream& stream,
                int level) const;

    /// Has no byte its top bit set?
    static bool IsAllAscii(const std::string& text);
};

}  // namespace AutoCli
