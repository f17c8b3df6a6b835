#pragma once

#include <zelmar/zelmar.h>

/// "markdown": a table of GitHub Flavored Markdown (section 4.10 of its specification). Every text
/// shows as it is; a line feed becomes `<br>`, and what is nested is JSON in its cell. The notation
/// knows no table without a header.
class MarkdownFormatter : public AutoCli::Formatter {
public:
    MarkdownFormatter();
    bool Format(const std::shared_ptr<CallSpec::Output>& output,
                AutoCli::FormatParameters& parameters, AutoCli::DisplayContext& context,
                std::ostream& stream) override;
};
