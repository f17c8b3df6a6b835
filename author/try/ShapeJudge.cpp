#include <author/lint/Suggest.h>
#include <author/try/ShapeJudge.h>

#include <algorithm>

using MetaObj::MetaCast;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace Author {

namespace {

struct ValueElement {
    const char* name;
    MetaType type;
};
constexpr ValueElement valueElements[] = {{"int", MetaType::Int},
                                          {"bool", MetaType::Bool},
                                          {"string", MetaType::String},
                                          {"structure", MetaType::Struct},
                                          {"list", MetaType::List}};

// By these names others know the same values, the formatter "xml" among them.
constexpr std::pair<std::string_view, const char*> namesElsewhere[] = {
    {"integer", "int"},      {"number", "int"},       {"boolean", "bool"},
    {"str", "string"},       {"text", "string"},      {"array", "list"},
    {"object", "structure"}, {"struct", "structure"}, {"item", "structure"}};

constexpr auto isBlank = [](char c) { return c == ' ' || c == '\t' || c == '\n' || c == '\r'; };

const char* NameFor(MetaType type) {
    return std::ranges::find(valueElements, type, &ValueElement::type)->name;
}

bool IsValueElement(std::string_view name) {
    return std::ranges::find(valueElements, name, &ValueElement::name) != std::end(valueElements);
}

std::string Advice(std::string_view name) {
    const auto* row =
        std::ranges::find(namesElsewhere, name, &std::pair<std::string_view, const char*>::first);
    std::string meant = row != std::end(namesElsewhere)
                            ? row->second
                            : Nearest(name, {"int", "bool", "string", "structure", "list"});
    return meant.empty() ? "" : "; write <" + meant + ">";
}

// Stands for the items of a list of scalars, which has no prototype of them.
const MetaObject* ItemOf(const MetaList& list) {
    static const auto number = MetaObj::MetaInt::New();
    static const auto truth = MetaObj::MetaBool::New(false);
    static const auto text = MetaObj::MetaString::New("");
    switch (list.GetListType()) {
        case MetaType::Int:
            return number.get();
        case MetaType::Bool:
            return truth.get();
        case MetaType::String:
            return text.get();
        default:
            return list.GetListStructure().get();
    }
}

std::vector<std::string> FieldNames(const MetaObject* structure) {
    const auto* declared = MetaCast<MetaStruct>(structure);
    return declared ? declared->GetFieldNames() : std::vector<std::string>();
}

std::string Tag(std::string_view name) {
    return "<" + std::string(name) + ">";
}

}  // namespace

void ShapeJudge::Tell(const Element& element, const std::string& text) {
    _faults.Add(element.line, element.place.empty() ? text : element.place + ": " + text);
}

std::string_view ShapeJudge::Innermost() const {
    return _open.empty() ? std::string_view() : _open.back().name;
}

void ShapeJudge::Open(long line, std::string_view name, const Attributes& attributes) {
    if (_open.empty()) {
        _open.push_back({.role = Role::Root, .name = std::string(name), .place = "", .line = line});
        return;
    }
    const Element& around = _open.back();
    switch (around.role) {
        case Role::Root:
        case Role::Field:
        case Role::List:
            OpenValue(line, name, attributes);
            return;
        case Role::Structure:
            if (name == "field") {
                OpenField(line, attributes);
                return;
            }
            _faults.Add(line, around.place + ": " + Tag(name) +
                                  " in a structure is dropped; write <field name=\"...\">");
            break;
        case Role::Scalar:
            _faults.Add(line, around.place + ": " + Tag(name) + " in " + Tag(around.name) +
                                  " is dropped, with all that is in it");
            _open.back().isOpenText = false;
            break;
        case Role::Dropped:
            break;
    }
    Drop(line, name);
}

void ShapeJudge::Drop(long line, std::string_view name) {
    _open.push_back({.role = Role::Dropped, .name = std::string(name), .place = "", .line = line});
}

void ShapeJudge::OpenField(long line, const Attributes& attributes) {
    Element field{.role = Role::Field, .name = "field", .place = _open.back().place, .line = line};
    const std::string name = TakeAttribute(field, attributes, "name");
    Element& structure = _open.back();
    if (name.empty()) {
        Tell(field, "<field> has no name, and the document is refused");
        _open.push_back(std::move(field));
        return;
    }
    field.place += "." + name;
    if (const auto* declared = MetaCast<MetaStruct>(structure.expected)) {
        field.expected = declared->GetField(name).get();
        if (!field.expected) {
            const std::string meant = Nearest(name, FieldNames(declared));
            Tell(field, "there is no such field in '" + declared->GetTypeName() + "'" +
                            (meant.empty() ? "" : "; did you mean '" + meant + "'?"));
            structure.fields.insert(meant);  // one fault, and not a lacking field as well
        }
    }
    if (!structure.fields.insert(name).second) {
        Tell(field, "the field stands there twice, and the last one counts");
    }
    _open.push_back(std::move(field));
}

std::string ShapeJudge::PlaceOfNextValue(Element& around) const {
    const size_t index = around.values++;
    return around.role == Role::Root    ? "result"
           : around.role == Role::Field ? around.place
                                        : around.place + "[" + std::to_string(index) + "]";
}

const MetaObject* ShapeJudge::ExpectedIn(const Element& around) const {
    if (around.role == Role::List) {
        const auto* list = MetaCast<MetaList>(around.expected);
        return list ? ItemOf(*list) : nullptr;
    }
    return around.role == Role::Root ? _declared : around.expected;
}

void ShapeJudge::OpenValue(long line, std::string_view name, const Attributes& attributes) {
    Element& around = _open.back();
    Element value{.role = Role::Scalar,
                  .name = std::string(name),
                  .place = PlaceOfNextValue(around),
                  .line = line};
    if (around.role != Role::List && around.values > 1) {
        Tell(value, Tag(name) + " is a second value, and is dropped");
        Drop(line, name);
        return;
    }
    if (!IsValueElement(name)) {
        Tell(value, Tag(name) + " is no value, and the document is refused" + Advice(name));
        Drop(line, name);
        return;
    }
    value.expected = IsExpectedKind(around, value) ? ExpectedIn(around) : nullptr;
    if (name == "list") {
        OpenList(std::move(value), attributes);
    } else if (name == "structure") {
        OpenStructure(std::move(value), attributes);
    } else {
        TakeAttribute(value, attributes, "");
        _open.push_back(std::move(value));
    }
}

bool ShapeJudge::IsExpectedKind(const Element& around, const Element& value) {
    const MetaObject* expected = ExpectedIn(around);
    const std::string wanted = around.role == Role::List ? around.itemName
                               : expected                ? NameFor(expected->GetType())
                                                         : "";
    if (wanted.empty() || wanted == value.name) {
        return true;
    }
    Tell(value,
         around.role == Role::List
             ? Tag(value.name) + " in a list of " + Tag(wanted) + ", and the document is refused"
             : Tag(value.name) + " where " + Tag(wanted) + " is declared");
    return false;
}

void ShapeJudge::OpenList(Element element, const Attributes& attributes) {
    element.role = Role::List;
    const std::string type = TakeAttribute(element, attributes, "type");
    const auto* declared = MetaCast<MetaList>(element.expected);
    const std::string wanted = declared ? NameFor(declared->GetListType()) : "";
    if (!IsValueElement(type) || type == "list") {
        Tell(element, "the list has " + (type.empty() ? "no type" : "the type " + Quoted(type)) +
                          ", and the document is refused; write type=\"" +
                          (wanted.empty() ? "structure" : wanted) + "\"");
        element.expected = nullptr;
    } else if (declared && type != wanted) {
        Tell(element, "a list of " + Tag(type) + " where one of " + Tag(wanted) + " is declared");
        element.expected = nullptr;
    }
    element.itemName = IsValueElement(type) && type != "list" ? type : "";
    _open.push_back(std::move(element));
}

void ShapeJudge::OpenStructure(Element element, const Attributes& attributes) {
    element.role = Role::Structure;
    const std::string type = TakeAttribute(element, attributes, "typeName");
    const auto* declared = MetaCast<MetaStruct>(element.expected);
    if (type.empty()) {
        Tell(element, "the structure has no typeName, and the document is refused");
    } else if (declared && type != declared->GetTypeName()) {
        Tell(element, "the structure is of the type " + Quoted(type) + "; '" +
                          declared->GetTypeName() + "' is declared");
    }
    _open.push_back(std::move(element));
}

// The value of the attribute; every other one is told of.
std::string ShapeJudge::TakeAttribute(const Element& element, const Attributes& attributes,
                                      std::string_view wanted) {
    std::string value;
    for (const Attribute& attribute : attributes) {
        if (attribute.name == wanted) {
            value = attribute.value;
        } else {
            Tell(element, Tag(element.name) + " has no attribute " + Quoted(attribute.name) +
                              (wanted.empty() ? "" : "; there is " + std::string(wanted)));
        }
    }
    return value;
}

void ShapeJudge::Text(long line, std::string_view text) {
    if (_open.empty() || _open.back().role == Role::Dropped) {
        return;
    }
    Element& element = _open.back();
    if (element.role == Role::Scalar) {
        AddPiece(element, text, true);
        return;
    }
    const auto start = std::ranges::find_if_not(text, isBlank);
    if (start != text.end()) {
        const auto last = text.find_last_not_of(" \t\r\n");
        const auto shown = std::string_view(start, text.begin() + static_cast<long>(last) + 1);
        if (shown.starts_with("ERROR:")) {
            return;  // of which more is told than that
        }
        Tell({.role = element.role,
              .name = "",
              .place = element.place,
              .line = line - std::count(start, text.end(), '\n')},
             "the text " + Quoted(shown) + " stands outside of a value, and is dropped");
    }
}

void ShapeJudge::Piece(long line, std::string_view content, bool isText) {
    if (!_open.empty() && _open.back().role == Role::Scalar) {
        AddPiece(_open.back(), content, false);
    } else if (isText) {
        Text(line, content);
    }
}

void ShapeJudge::AddPiece(Element& scalar, std::string_view text, bool isText) {
    if (isText && scalar.isOpenText) {
        scalar.content += text;
        return;
    }
    ++scalar.pieces;
    scalar.content = text;
    scalar.isOpenText = isText;
}

void ShapeJudge::Close() {
    if (_open.empty()) {
        return;  // of a document that is not well-formed
    }
    const Element element = std::move(_open.back());
    _open.pop_back();
    if (element.role == Role::Root && element.values == 0) {
        Tell(element, "there is no value in " + Tag(element.name));
    } else if (element.role == Role::Field && element.values == 0) {
        Tell(element, "the field has no value, and is dropped");
    } else if (element.role == Role::Structure) {
        TellLacking(element);
    } else if (element.role == Role::Scalar) {
        TellScalar(element);
    }
}

void ShapeJudge::TellLacking(const Element& structure) {
    for (const std::string& name : FieldNames(structure.expected)) {
        if (!structure.fields.contains(name)) {
            _faults.Add(structure.line, structure.place + "." + name + ": the field is lacking");
        }
    }
}

void ShapeJudge::TellScalar(const Element& scalar) {
    if (scalar.pieces > 1) {
        Tell(scalar, "of its " + std::to_string(scalar.pieces) +
                         " pieces (text, CDATA, comments) only the last is read, " +
                         Quoted(scalar.content));
    }
    if (const std::string fault = ScalarFault(scalar.name, scalar.content); !fault.empty()) {
        Tell(scalar, fault);
    }
}

}  // namespace Author
