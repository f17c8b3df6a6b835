#pragma once

#include <zelmar/autocli/formatters/Formatter.h>

namespace AutoCli {

/// The string field of that name; empty when it is absent or of another kind.
ZELMAR_EXPORT std::string GetStringField(std::shared_ptr<MetaObj::MetaStruct> structure,
                                         const std::string& name);

/// "commandhelp": the help of one command, from the struct that `CommandSpec::GenerateHelpOutput`
/// makes. Reads no format parameters.
///
/// Throws `ZelmarException`, before anything is written: "Error: Unexpected type for output,
/// formatter expected a struct with help information".
class ZELMAR_EXPORT CommandHelpFormatter : public Formatter {
public:
    CommandHelpFormatter();
    ~CommandHelpFormatter() override;

    bool Format(const std::shared_ptr<CallSpec::Output>& output, FormatParameters& parameters,
                DisplayContext& context, std::ostream& stream) override;
};

}  // namespace AutoCli
