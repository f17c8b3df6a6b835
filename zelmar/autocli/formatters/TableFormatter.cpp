#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/formatters/FieldText.h>
#include <zelmar/autocli/formatters/FitText.h>
#include <zelmar/autocli/formatters/TableFormatter.h>
#include <zelmar/metaobj/MetaList.h>

#include <algorithm>
#include <ostream>
#include <string_view>

using MetaObj::MetaCast;
using MetaObj::MetaList;
using MetaObj::MetaObject;
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
    explicit Row(const MetaStruct& item) : _item(item) {}

    const std::string& GetTypeName() const { return _item.GetTypeName(); }

    // Null when the row lacks it.
    const Value* ValueOf(const Column& column) {
        if (column.isPath) {
            return FindSubField(_item, column.name);
        }
        // Columns mostly stand in the order of the fields: then the next one needs no search.
        const auto& fields = _item.GetFields();
        if (_next == fields.end() || _next->first != column.name) {
            _next = fields.find(column.name);
        }
        if (_next == fields.end()) {
            return nullptr;
        }
        const Value& value = _next->second.value;
        ++_next;
        return &value;
    }

private:
    const MetaStruct& _item;
    std::map<std::string, MetaStruct::Field>::const_iterator _next = _item.GetFields().begin();
};

// One call of the formatter: what the columns are, and how wide.
class Table {
public:
    Table(const MetaList& list, FormatParameters& parameters, const DisplayContext& context,
          std::ostream& out)
        : _list(list), _parameters(parameters), _cells(parameters), _text(out, context) {
        auto names = ColumnNames(*list.GetListStructure(), parameters);
        std::ranges::transform(names, names.begin(), Trimmed);
        for (const std::string& name : names) {
            size_t& width =
                _widths.try_emplace(name, _text.WidthOf(name) + columnGap).first->second;
            _columns.push_back({name, width, name == names.back(), name.find('.') != name.npos});
        }
        _screenWidth = parameters.GetParameter("wrap-last") == "true" ? context.screenWidth : 0;
    }

    // False after an error that was written instead of the table.
    bool Write() {
        const std::string error = Measure();
        if (error.empty()) {
            if (ShowsHeader(_parameters) && !_columns.empty()) {
                WriteHeader();
            }
            WriteRows();
        } else {
            _text.Append(error);
            _text.EndLine();
        }
        _text.Finish();
        return error.empty();
    }

private:
    // The error, where there is one.
    std::string Measure() {
        for (const auto& item : _list.GetObjects()) {
            const auto* structure = MetaCast<MetaStruct>(item.get());
            if (!structure) {
                return "Error: Unexpected type, unable to get struct from list";
            }
            Row row(*structure);
            for (Column& column : _columns) {
                const Value* value = row.ValueOf(column);
                if (!value) {
                    return "Error: Unknown field in field list: " + column.name;
                }
                const auto text = _cells.Of(row.GetTypeName(), column.name, *value);
                column.width = std::max(column.width, _text.WidthOf(text) + columnGap);
            }
        }
        return "";
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
        _text.Append(std::string(_text.WidthOf(_columns.back().name), '-'));
        _text.EndLine();
    }

    void WriteRows() {
        const size_t lastColumn = WidthBeforeLast();
        const bool wraps = !_columns.empty() && lastColumn > 0 &&
                           lastColumn + _text.WidthOf(_columns.back().name) <= _screenWidth;
        const Fit fit = {.indent = static_cast<int>(lastColumn),
                         .width = static_cast<int>(_screenWidth),
                         .skipFirstIndent = true,
                         .splitLines = true};
        for (const auto& item : _list.GetObjects()) {
            Row row(static_cast<const MetaStruct&>(*item));
            for (const Column& column : _columns) {
                const Value& value = *row.ValueOf(column);
                if (wraps && column.isLast) {
                    FitText(value->ToString(), fit, _text);
                } else {
                    AppendCell(column, _cells.Of(row.GetTypeName(), column.name, value),
                               value->GetType() == MetaType::Int);
                }
            }
            _text.EndLine();
        }
    }

    void AppendCell(const Column& column, std::string_view text, bool isInt) {
        const size_t padding = column.width - _text.WidthOf(text);
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
    FieldText _cells;
    TextWriter _text;
    std::map<std::string, size_t> _widths;
    std::vector<Column> _columns;
    size_t _screenWidth;  // 0 when nothing is to wrap
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
    stream.setf(std::ios_base::left, std::ios_base::adjustfield);
    return Table(*list, parameters, context, stream).Write();
}

}  // namespace AutoCli
