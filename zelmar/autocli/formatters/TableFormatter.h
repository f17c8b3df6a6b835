#pragma once

#include <zelmar/autocli/formatters/Formatter.h>

namespace AutoCli {

/// "table": a list of structs as one row an item and one column a field. Columns are as wide as
/// their longest cell, in the unit of the context, and no text is ever cut; only the last column
/// wraps, on request, at the width of the screen. All rows are measured before the first is
/// written, so an error is never mixed with a half-written table.
///
/// Throws `ZelmarException`, before anything is written: "Error: Unexpected type for output,
/// formatter, table, expected a List of structs"; "Error: Unable to get structure type from list
/// output."
class ZELMAR_EXPORT TableFormatter : public Formatter {
public:
    TableFormatter();
    ~TableFormatter() override;

    bool Format(const std::shared_ptr<CallSpec::Output>& output, FormatParameters& parameters,
                DisplayContext& context, std::ostream& stream) override;
};

}  // namespace AutoCli
