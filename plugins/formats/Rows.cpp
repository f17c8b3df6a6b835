#include "Rows.h"

#include <algorithm>

using AutoCli::FormatParameters;
using MetaObj::MetaCast;
using MetaObj::MetaList;
using MetaObj::MetaString;
using MetaObj::MetaStruct;
using MetaObj::MetaType;
using Zelmar::ZelmarException;

namespace {

std::string Trimmed(const std::string& text) {
    constexpr const char* blanks = " \t\f\v\n\r";
    const size_t first = text.find_first_not_of(blanks);
    return first == std::string::npos
               ? ""
               : text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

std::vector<std::string> ColumnsOf(const MetaStruct& structure,
                                   const FormatParameters& parameters) {
    for (const std::string& key : {"fields:" + structure.GetTypeName(), std::string("fields"),
                                   std::string("table-columns")}) {
        if (parameters.HasParameter(key)) {
            auto names = parameters.GetParameterAsList(key);
            std::ranges::transform(names, names.begin(), Trimmed);
            return names;
        }
    }
    return structure.GetFieldNames();
}

FormatParameters FieldFormats(const FormatParameters& parameters, Rows::Units units) {
    FormatParameters formats;
    for (const auto& [key, value] : parameters.GetParameters()) {
        if (key.starts_with("printf:") || (units == Rows::Units::On && key.starts_with("units:"))) {
            formats.SetParameter(key, value);
        }
    }
    return formats;
}

}  // namespace

Rows::Rows(const CallSpec::Output& output, const FormatParameters& parameters, Units units)
    : _root(output.GetRootObject()),
      _list(MetaCast<MetaList>(_root.get())),
      _sample(_list ? _list->GetListStructure() : _root),
      _formats(FieldFormats(parameters, units)) {
    if (_list && _list->GetListType() == MetaType::Struct && !_sample) {
        return;  // an empty list of nobody knows what
    }
    const auto* structure = MetaCast<MetaStruct>(_sample.get());
    if (!structure) {
        _sample = nullptr;
        _columns = {"Value"};
        return;
    }
    _columns = ColumnsOf(*structure, parameters);
    for (size_t column = 0; column < _columns.size(); ++column) {
        if (!Find(_sample, column)) {
            throw ZelmarException("Error: Unknown field in field list: " + _columns[column]);
        }
    }
}

size_t Rows::Count() const {
    return _list ? _list->GetCount() : 1;
}

bool Rows::IsNumber(size_t column) {
    if (_list && !_sample) {
        return _list->GetListType() == MetaType::Int;
    }
    if (!_sample) {
        return _root && _root->GetType() == MetaType::Int;
    }
    return Find(_sample, column)->GetType() == MetaType::Int;
}

const Rows::Value& Rows::Cell(size_t row, size_t column) {
    return _sample ? Find(Item(row), column) : Item(row);
}

const Rows::Value& Rows::Item(size_t row) const {
    return _list ? _list->GetObjects()[row] : _root;
}

const Rows::Value& Rows::Find(const Value& item, size_t column) {
    const auto* structure = MetaCast<MetaStruct>(item.get());
    if (!structure) {
        return _found = nullptr;
    }
    const std::string& name = _columns[column];
    const auto& fields = structure->GetFields();
    // Columns mostly stand in the order of the fields: then the next one needs no search.
    if (structure != _structure) {
        _structure = structure;
        _next = fields.begin();
    }
    if (_next == fields.end() || _next->first != name) {
        _next = fields.find(name);
    }
    if (_next != fields.end()) {
        return (_next++)->second.value;  // also when it has dots in its name
    }
    return _found = name.find('.') == std::string::npos
                        ? nullptr
                        : AutoCli::GetSubField(std::static_pointer_cast<MetaStruct>(item), name);
}

std::string_view Rows::TextOf(size_t row, size_t column, const Value& cell) {
    if (!cell) {
        return "";
    }
    if (_sample && !_formats.GetParameters().empty()) {
        const auto& structure = static_cast<const MetaStruct&>(*Item(row));
        return _text = AutoCli::AutoCli_FormatField(structure.GetTypeName(), _columns[column], cell,
                                                    _formats);
    }
    if (const auto* text = MetaCast<MetaString>(cell.get())) {
        return text->GetValue();
    }
    return _text = cell->ToString();
}

bool IsNested(const Rows::Value& value) {
    return MetaCast<MetaStruct>(value.get()) || MetaCast<MetaList>(value.get());
}

bool ShowsHeader(const FormatParameters& parameters) {
    const std::string& shown = parameters.GetParameter("show-header");
    return (shown.empty() ? parameters.GetParameter("table-header") : shown) != "false";
}

std::vector<AutoCli::FormatterParam> RowParameters(Rows::Units units) {
    std::vector<AutoCli::FormatterParam> parameters = {
        {"fields:<TypeName>",
         "The fields of the type named in <TypeName> to print, in their order.  A field of a struct"
         " inside is named by its path, with dots"},
        {"fields", "The same for all types"},
        {"show-header", "If 'false' leave out the names of the columns"},
        {"printf:<TypeName>.<FieldName>",
         "Print the field as this format of printf, with one conversion, says"},
    };
    if (units == Rows::Units::On) {
        parameters.push_back(
            {"units:<TypeName>.<FieldName>", "Print this text, behind a blank, behind the field"});
    }
    return parameters;
}
