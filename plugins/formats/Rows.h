#pragma once

#include <zelmar/zelmar.h>

#include <map>
#include <string>
#include <string_view>
#include <vector>

/// A result as rows and columns: of a list of structs a row each, of one struct a single row, and
/// of anything else one column with the name "Value".
///
/// The columns are those that `fields:<TypeName>`, `fields` or `table-columns` names, the first of
/// them that is there, with dots into structs inside; otherwise all fields. A field that a row
/// lacks is null.
class Rows {
public:
    using Value = std::shared_ptr<MetaObj::MetaObject>;
    enum class Units : bool { Off, On };

    /// Where the units are off, the numbers stay numbers. Keeps a reference to the value alone.
    /// Throws `ZelmarException`: "Error: Unknown field in field list: <name>".
    Rows(const CallSpec::Output& output, const AutoCli::FormatParameters& parameters, Units units);

    [[nodiscard]] size_t Count() const;
    [[nodiscard]] const std::vector<std::string>& Columns() const { return _columns; }
    /// Are the column's cells integers, as far as is known without looking at the rows?
    [[nodiscard]] bool IsNumber(size_t column);

    /// Lives until the next call.
    const Value& Cell(size_t row, size_t column);
    /// The text of a scalar that `Cell` gave, with the parameters `printf:` and `units:` heeded,
    /// and the empty text for null. Lives until the next call.
    std::string_view TextOf(size_t row, size_t column, const Value& cell);

private:
    [[nodiscard]] const Value& Item(size_t row) const;
    const Value& Find(const Value& item, size_t column);

    const Value _root;
    const MetaObj::MetaList* _list;  // null when the root is the only row
    Value _sample;                   // the struct whose fields the columns are; null without one
    std::vector<std::string> _columns;
    AutoCli::FormatParameters _formats;
    const MetaObj::MetaStruct* _structure = nullptr;  // the one that was looked at last
    std::map<std::string, MetaObj::MetaStruct::Field>::const_iterator _next;
    Value _found;
    std::string _text;
};

/// Is it a struct or a list?
bool IsNested(const Rows::Value& value);

/// The rule of the table: not when `show-header`, or where that is empty `table-header`, is
/// "false".
bool ShowsHeader(const AutoCli::FormatParameters& parameters);

/// What the formatters of rows tell their users of their parameters.
std::vector<AutoCli::FormatterParam> RowParameters(Rows::Units units);
