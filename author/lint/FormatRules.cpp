#include <author/lint/Rules.h>
#include <author/lint/Suggest.h>

#include <algorithm>
#include <map>
#include <set>
#include <sstream>

namespace Author {

namespace {

using AutoCli::FormatParameters;
using MetaObj::MetaCast;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;

AutoCli::Dispatcher& Engine() {
    static AutoCli::Dispatcher dispatcher;
    return dispatcher;
}

// The declared shape, by the names of its structures.
struct Shape {
    std::shared_ptr<MetaObject> root;
    std::string rowType;  // of a list of structures
    std::map<std::string, std::shared_ptr<MetaStruct>> structures;

    [[nodiscard]] std::vector<std::string> TypeNames() const {
        std::vector<std::string> names;
        for (const auto& [name, structure] : structures) {
            names.push_back(name);
        }
        return names;
    }
};

void AddStructures(const std::shared_ptr<MetaObject>& value, Shape& shape) {
    if (const auto* list = MetaCast<MetaList>(value.get())) {
        AddStructures(list->GetListStructure(), shape);
    } else if (const auto* structure = MetaCast<MetaStruct>(value.get())) {
        shape.structures.emplace(structure->GetTypeName(),
                                 std::static_pointer_cast<MetaStruct>(value));
        for (const auto& [name, field] : structure->GetFields()) {
            AddStructures(field.value, shape);
        }
    }
}

Shape ShapeOf(const std::shared_ptr<MetaObject>& root) {
    Shape shape{root, "", {}};
    AddStructures(root, shape);
    const auto* list = MetaCast<MetaList>(root.get());
    if (list && list->GetListStructure()) {
        shape.rowType = list->GetListStructure()->GetTypeName();
    }
    return shape;
}

// What the formatter has against the shape; empty for nothing.
std::string Refusal(const std::string& formatter, const Shape& shape) {
    auto output = CallSpec::Output::New();
    output->SetRootObject(shape.root);
    FormatParameters parameters;
    parameters.SetFormatter(formatter);
    AutoCli::DisplayContext context;
    std::ostringstream text;
    try {
        Engine().FormatOutput(output, parameters, context, text);
        return "";
    } catch (const Zelmar::ZelmarException& error) {
        return error.what();
    }
}

std::vector<std::string> FormatterNames() {
    std::vector<std::string> names;
    for (const auto& formatter : Engine().GetFormatters()) {
        names.push_back(formatter->GetName());
    }
    return names;
}

void CheckFormatter(const xmlNode* place, const std::string& name, const Shape& shape,
                    Report& report) {
    if (name.empty()) {
        report.AddWarning(place, "formatter",
                          "without a <formatter> nothing is printed unless the user asks for one");
    } else if (!Engine().HasFormatter(name)) {
        const std::string text = "there is no formatter '" + name + "'";
        const auto names = FormatterNames();
        if (Nearest(name, names).empty()) {
            report.AddWarning(place, "formatter",
                              text +
                                  " but a plugin may bring it; the engine has table, simple, "
                                  "json, xml and python");
        } else {
            report.AddError(place, "formatter", text + Suggestion(name, names));
        }
    } else if (const std::string refusal = Refusal(name, shape); !refusal.empty() && shape.root) {
        report.AddError(place, "formatter",
                        "the formatter " + name + " cannot print the declared shape: " + refusal);
    }
}

// The keys that formatters read, up to their colon; those that they declare, and these.
std::vector<std::string> Keys() {
    std::set<std::string> keys = {"fields", "table-columns", "table-header", "stylesheet"};
    for (const auto& formatter : Engine().GetFormatters()) {
        for (const AutoCli::FormatterParam& parameter : formatter->GetParams()) {
            keys.insert(parameter.name.substr(0, parameter.name.find(':')));
        }
    }
    return {keys.begin(), keys.end()};
}

class KeyCheck {
public:
    KeyCheck(const xmlNode* place, const FormatParameters& parameters, const Shape& shape,
             Report& report)
        : _place(place),
          _key(Attribute(place, "name")),
          _value(Content(place)),
          _parameters(parameters),
          _shape(shape),
          _report(report) {}

    void Run() {
        static const std::vector<std::string> keys = Keys();
        const size_t colon = _key.find(':');
        const std::string base = _key.substr(0, colon);
        const std::string rest = colon == std::string::npos ? "" : _key.substr(colon + 1);
        if (std::ranges::find(keys, base) == keys.end()) {
            _report.AddError(_place, "key",
                             "no formatter reads '" + base + "'" + Suggestion(base, keys));
        } else if (base == "units" || base == "printf") {
            CheckFieldKey(base, rest);
        } else if (base == "header") {
            CheckHeading(rest);
        } else if (base == "fields" && !rest.empty()) {
            CheckType(rest);
            CheckFields(rest);
        } else if (base == "fields" || base == "table-columns") {
            CheckFields(_shape.rowType);
        }
    }

private:
    [[nodiscard]] bool IsTable() const { return _parameters.GetFormatter() == "table"; }

    bool CheckType(const std::string& type) {
        if (_shape.structures.contains(type)) {
            return true;
        }
        _report.AddError(_place, "field",
                         "'" + _key + "' has no effect: the output has no structure '" + type +
                             "'" + Suggestion(type, _shape.TypeNames()));
        return false;
    }

    // A table reaches into structures by dots, and trims the names.
    std::shared_ptr<MetaObject> FindField(const std::string& type, std::string name) const {
        const auto structure = _shape.structures.find(type);
        if (structure == _shape.structures.end()) {
            return nullptr;
        }
        if (!IsTable() || type != _shape.rowType) {
            return structure->second->GetField(name);
        }
        name.erase(0, name.find_first_not_of(" \t\n"));
        name.erase(name.find_last_not_of(" \t\n") + 1);
        return AutoCli::GetSubField(structure->second, name);
    }

    void TellMissing(const std::string& type, const std::string& field) {
        const auto names = _shape.structures.at(type)->GetFieldNames();
        const bool hasBlank =
            std::ranges::find(names, field.substr(std::min<size_t>(field.find_first_not_of(' '),
                                                                   field.size()))) != names.end();
        _report.AddError(_place, "field",
                         "the structure " + type + " has no field '" + field + "'" +
                             (hasBlank ? "; blanks count: write none beside the commas"
                                       : Suggestion(field, names)));
    }

    void CheckFields(const std::string& type) {
        if (!_shape.structures.contains(type)) {
            return;
        }
        for (const std::string& field : _parameters.GetParameterAsList(_key)) {
            if (!FindField(type, field)) {
                TellMissing(type, field);
            }
        }
    }

    void CheckFieldKey(const std::string& base, const std::string& rest) {
        const size_t dot = rest.find('.');
        if (dot == std::string::npos) {
            _report.AddError(_place, "key",
                             "'" + _key + "' names no field; write " + base + ":TYPE.FIELD");
            return;
        }
        const std::string type = rest.substr(0, dot);
        const std::string name = rest.substr(dot + 1);
        if (!CheckType(type)) {
            return;
        }
        const auto field = FindField(type, name);
        if (!field) {
            TellMissing(type, name);
        } else if (base == "printf") {
            CheckPrintf(type, name, field);
        }
    }

    void CheckPrintf(const std::string& type, const std::string& name,
                     const std::shared_ptr<MetaObject>& field) {
        FormatParameters parameters;
        parameters.SetParameter(_key, _value);
        const std::string text = AutoCli::AutoCli_FormatField(type, name, field, parameters);
        const MetaObj::MetaType kind = field->GetType();
        if (kind == MetaObj::MetaType::Struct || kind == MetaObj::MetaType::List) {
            _report.AddError(
                _place, "printf",
                "'" + name + "' is no single value, and comes out empty; leave it out");
        } else if (text.starts_with("Error while handling formatting parameter")) {
            const bool isText = kind == MetaObj::MetaType::String;
            _report.AddError(_place, "printf",
                             "'" + _value + "' does not fit '" + name + "', which is of the type " +
                                 MetaObj::MetaTypeString(kind) + "; write one conversion, as in " +
                                 (isText ? "%-20s" : "%08d"));
        }
    }

    // Names between percent signs, of which the formatter fills in the last one alone.
    void CheckHeading(const std::string& type) {
        if (!CheckType(type)) {
            return;
        }
        std::set<std::string> fields;
        for (size_t begin = _value.find('%'); begin != std::string::npos;) {
            const size_t end = _value.find('%', begin + 1);
            if (end == std::string::npos) {
                break;
            }
            const std::string name = _value.substr(begin + 1, end - begin - 1);
            const bool isField = _shape.structures.at(type)->HasField(name);
            if (isField) {
                fields.insert(name);
            } else if (!name.empty() && name.find(' ') == std::string::npos) {
                TellMissing(type, name);
            }
            begin = isField ? _value.find('%', end + 1) : end;
        }
        if (fields.size() > 1) {
            _report.AddError(
                _place, "heading",
                "a heading takes one field, and the first ones stay as they stand here; "
                "leave one");
        }
    }

    const xmlNode* _place;
    std::string _key;
    std::string _value;
    const FormatParameters& _parameters;
    const Shape& _shape;
    Report& _report;
};

}  // namespace

void CheckFormat(const DeclaredCommand& command, Report& report) {
    const xmlNode* place = Child(command.node, "format-parameters");
    const FormatParameters parameters = command.command->GetDefaultOutputFormatParameters();
    const Shape shape = ShapeOf(command.command->GetOutputSpec()->GetRootObject());
    const xmlNode* formatter = Child(place, "formatter");
    CheckFormatter(formatter ? formatter : place, parameters.GetFormatter(), shape, report);
    for (const xmlNode* parameter : Children(place, "format-parameter")) {
        KeyCheck(parameter, parameters, shape, report).Run();
    }
}

}  // namespace Author
