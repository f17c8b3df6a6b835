#pragma once

#include <zelmar/zelmar.h>

/// "html": one page with a table, without any script, in UTF-8. Every text is escaped; a struct in
/// a cell is a list of names and values, and a list in a cell a list of items.
class HtmlFormatter : public AutoCli::Formatter {
public:
    HtmlFormatter();
    bool Format(const std::shared_ptr<CallSpec::Output>& output,
                AutoCli::FormatParameters& parameters, AutoCli::DisplayContext& context,
                std::ostream& stream) override;
};
