#pragma once

#include <zelmar/zelmar.h>

/// "csv": comma-separated values (RFC 4180), with a line of names and lines that end in CR LF.
/// Bytes are written as they are; what is nested is JSON in its cell. Numbers have no units, so
/// that they stay numbers.
class CsvFormatter : public AutoCli::Formatter {
public:
    CsvFormatter();
    bool Format(const std::shared_ptr<CallSpec::Output>& output,
                AutoCli::FormatParameters& parameters, AutoCli::DisplayContext& context,
                std::ostream& stream) override;
};

/// "tsv": the same with tabs between the cells and no quotes: tab, line feed, carriage return and
/// backslash are `\t`, `\n`, `\r` and `\\`, so that a line is a row whatever the cells hold.
class TsvFormatter : public AutoCli::Formatter {
public:
    TsvFormatter();
    bool Format(const std::shared_ptr<CallSpec::Output>& output,
                AutoCli::FormatParameters& parameters, AutoCli::DisplayContext& context,
                std::ostream& stream) override;
};
