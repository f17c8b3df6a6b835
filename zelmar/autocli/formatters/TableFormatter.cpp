#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/formatters/FitString.h>
#include <zelmar/autocli/formatters/TableFormatter.h>
#include <zelmar/autocli/formatters/TextWriter.h>
#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <algorithm>
#include <charconv>
#include <ostream>
#include <string_view>

using MetaObj::MetaCast;
using MetaObj::MetaInt;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaString;
using MetaObj::MetaStruct;
using MetaObj::MetaType;
using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

constexpr size_t columnGap = 2;

struct Column {
    std::string name;
    size_t& width;  // shared by all columns of that name
    bool isLast;    // so is this
    bool isPath;    // leads into a nested struct
};

std::string Trimmed(const std::string& text) {
    constexpr const char* blanks = " \t\f\v\n\r";
    const size_t first = text.find_first_not_of(blanks);
    return first == std::string::npos
               ? ""
               : text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

std::vector<std::string> ColumnNames(const MetaStruct& structure,
                                     const FormatParameters& parameters) {
    for (const std::string& key : {"fields:" + structure.GetTypeName(), std::string("fields"),
                                   std::string("table-columns")}) {
        if (parameters.HasParameter(key)) {
            return parameters.GetParameterAsList(key);
        }
    }
    return structure.GetFieldNames();
}

bool ShowsHeader(const FormatParameters& parameters) {
    const std::string& shown = parameters.GetParameter("show-header");
    return (shown.empty() ? parameters.GetParameter("table-header") : shown) != "false";
}

using Value = std::shared_ptr<MetaObject>;

// One struct of the list, which is asked for the values of the columns in their order.
class Row {
public:
    explicit Row(const Value& item)
        : _item(item), _fields(static_cast<const MetaStruct&>(*item).GetFields()) {}

    const std::string& GetTypeName() const {
        return static_cast<const MetaStruct&>(*_item).GetTypeName();
    }

    // Null when the row lacks it. Lives until the next call.
    const Value& ValueOf(const Column& column) {
        if (column.isPath) {
            return _subValue =
                       GetSubField(std::static_pointer_cast<MetaStruct>(_item), column.name);
        }
        // Columns mostly stand in the order of the fields: then the next one needs no search.
        if (_next == _fields.end() || _next->first != column.name) {
            _next = _fields.find(column.name);
        }
        return _next == _fields.end() ? _subValue = nullptr : (_next++)->second.value;
    }

private:
    const Value& _item;
    const std::map<std::string, MetaStruct::Field>& _fields;
    std::map<std::string, MetaStruct::Field>::const_iterator _next = _fields.begin();
    Value _subValue;
};

// One call of the formatter: what the columns are, and how wide.
class Table {
public:
    Table(const MetaList& list, FormatParameters& parameters, const DisplayContext& context,
          std::ostream& out)
        : _list(list),
          _parameters(parameters),
          _hasFieldFormats(HasFieldFormats(parameters)),
          _out(out),
          _text(out) {
        auto names = ColumnNames(*list.GetListStructure(), parameters);
        std::ranges::transform(names, names.begin(), Trimmed);
        for (const std::string& name : names) {
            size_t& width = _widths.try_emplace(name, name.size() + columnGap).first->second;
            _columns.push_back({name, width, name == names.back(), name.find('.') != name.npos});
        }
        _screenWidth = parameters.GetParameter("wrap-last") == "true" ? context.screenWidth : 0;
    }

    // False after an error that was written to the stream.
    bool Measure() {
        for (const auto& item : _list.GetObjects()) {
            if (!MetaCast<MetaStruct>(item.get())) {
                _out << "Error: Unexpected type, unable to get struct from list" << std::endl;
                return false;
            }
            Row row(item);
            for (Column& column : _columns) {
                const auto& value = row.ValueOf(column);
                if (!value) {
                    _out << "Error: Unknown field in field list: " << column.name << std::endl;
                    return false;
                }
                column.width =
                    std::max(column.width, CellText(row, column, value).size() + columnGap);
            }
        }
        return true;
    }

    void Write() {
        _out.setf(std::ios_base::left, std::ios_base::adjustfield);
        if (ShowsHeader(_parameters) && !_columns.empty()) {
            WriteHeader();
        }
        const size_t startColumn = WidthBeforeLast();
        const bool wraps = !_columns.empty() && startColumn > 0 &&
                           startColumn + _columns.back().name.size() <= _screenWidth;
        for (const auto& item : _list.GetObjects()) {
            Row row(item);
            for (const Column& column : _columns) {
                const auto& value = row.ValueOf(column);
                if (wraps && column.isLast) {
                    _text.Finish();
                    AutoCli_FitString(static_cast<int>(startColumn), static_cast<int>(_screenWidth),
                                      value->ToString(), true, _out, false, 0, true);
                } else {
                    AppendCell(column, CellText(row, column, value),
                               value->GetType() == MetaType::Int);
                }
            }
            _text.EndLine();
        }
        _text.Finish();
    }

private:
    // Lives until the next call. No string is made where the value's own text will do.
    std::string_view CellText(const Row& row, const Column& column, const Value& value) {
        if (_hasFieldFormats) {
            return _cell = AutoCli_FormatField(row.GetTypeName(), column.name, value, _parameters);
        }
        if (const auto* text = MetaCast<MetaString>(value.get())) {
            return text->GetValue();
        }
        if (const auto* number = MetaCast<MetaInt>(value.get())) {
            const auto end =
                std::to_chars(std::begin(_digits), std::end(_digits), number->GetValue());
            return {_digits, end.ptr};
        }
        return _cell = value->ToString();
    }

    size_t WidthBeforeLast() const {
        size_t width = 0;
        for (const Column& column : _columns) {
            width += column.isLast ? 0 : column.width;
        }
        return width;
    }

    void WriteHeader() {
        for (const Column& column : _columns) {
            AppendCell(column, column.name, false);
        }
        _text.EndLine();
        if (_parameters.GetParameter("header-line") == "false") {
            return;
        }
        for (const Column& column : _columns) {
            if (!column.isLast) {
                _text.Append(std::string(column.width - columnGap, '-'));
                _text.AppendBlanks(columnGap);
            }
        }
        _text.Append(std::string(_columns.back().name.size(), '-'));
        _text.EndLine();
    }

    void AppendCell(const Column& column, std::string_view text, bool isInt) {
        const size_t padding = column.width - text.size();
        if (isInt) {
            _text.AppendBlanks(padding - columnGap);
            _text.Append(text);
            _text.AppendBlanks(columnGap);
        } else {
            _text.Append(text);
            _text.AppendBlanks(column.isLast ? 0 : padding);
        }
    }

    const MetaList& _list;
    FormatParameters& _parameters;
    const bool _hasFieldFormats;
    std::ostream& _out;
    TextWriter _text;
    std::map<std::string, size_t> _widths;
    std::vector<Column> _columns;
    size_t _screenWidth;  // 0 when nothing is to wrap
    std::string _cell;
    char _digits[24];
};

}  // namespace

TableFormatter::TableFormatter() : Formatter("table") {
    _description =
        "Print a list of structs as a table, with each row being one entry in the list and each"
        " column being a field of the structure.";
    _params = {
        {"fields:<TypeName>",
         "The list of fields and the order in which to print them for the type named in"
         " <TypeName>"},
        {"show-header", "Optionally disable showing column headers by passing the 'false' value"},
        {"wrap-last", "If 'true' wrap the last column to the width of the terminal."},
        {"units:<TypeName>.<FieldName>",
         "Use the given 'units' value as a suffix for a given field.  For example specifying"
         " \"units:ScsiDeviceList.Size\" = \"Mb\" would append the string 'Mb' to the end of a"
         " field"},
        {"printf:<TypeName>.<FieldName>",
         "Use the given 'printf' formatting string for printing a value.  This uses standard"
         " printf syntax to format and print a Value.  For example specifying"
         " \"units:ScsiDeviceList.Size\" = \"Mb\" would append the string 'Mb' to the end of a"
         " field"},
        {"header-line",
         "Optionally remove the line of '-' characters after the header.  By default this paramter"
         " is assumed to be true.  Setting it to 'false' will remove the line.  This parameter only"
         " has meaning if 'show-header' is also true"},
    };
}

TableFormatter::~TableFormatter() = default;

bool TableFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                            FormatParameters& parameters, DisplayContext& context,
                            std::ostream& stream) {
    const auto root = output->GetRootObject();
    const auto* list = MetaCast<MetaList>(root.get());
    if (!list || list->GetListType() != MetaType::Struct) {
        throw ZelmarException(
            "Error: Unexpected type for output, formatter, table, expected a List of structs");
    }
    if (!list->GetListStructure()) {
        if (list->GetCount() == 0) {
            return true;
        }
        throw ZelmarException("Error: Unable to get structure type from list output.");
    }
    Table table(*list, parameters, context, stream);
    if (!table.Measure()) {
        return false;
    }
    table.Write();
    return true;
}

}  // namespace AutoCli
