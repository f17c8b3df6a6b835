#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/StreamInt.h>
#include <zelmar/autocli/extension/ValueBuilder.h>
#include <zelmar/autocli/extension/XmlUtil.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <algorithm>

using MetaObj::MetaBool;
using MetaObj::MetaInt;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaString;
using MetaObj::MetaStruct;
using MetaObj::MetaType;
using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

constexpr std::pair<std::string_view, MetaType> listTypes[] = {
    {"int", MetaType::Int},          {"bool", MetaType::Bool}, {"string", MetaType::String},
    {"structure", MetaType::Struct}, {"list", MetaType::List},
};

std::shared_ptr<MetaObject> CopyShape(const std::shared_ptr<MetaObject>& value);

std::shared_ptr<MetaStruct> CopyShape(const MetaStruct& structure) {
    auto shape = MetaStruct::New(structure.GetTypeName());
    for (const auto& [name, field] : structure.GetFields()) {
        shape->SetField(name, CopyShape(field.value));
    }
    return shape;
}

std::shared_ptr<MetaObject> CopyShape(const MetaList& list) {
    if (list.GetListType() != MetaType::Struct) {
        return MetaList::New(list.GetListType());
    }
    const auto& structure = list.GetListStructure();
    return MetaList::New(MetaType::Struct, structure ? CopyShape(*structure) : nullptr);
}

// A list takes its shape from its first item, and is then given that item, too. A copy of the shape
// takes of a list in it the declaration and not the items.
std::shared_ptr<MetaObject> CopyShape(const std::shared_ptr<MetaObject>& value) {
    if (const auto* structure = MetaObj::MetaCast<MetaStruct>(value.get())) {
        return CopyShape(*structure);
    }
    const auto* list = MetaObj::MetaCast<MetaList>(value.get());
    return list ? CopyShape(*list) : value;
}

void Replay(const XmlNode& node, XmlEvents& events) {
    if (node.content) {
        events.Leaf(node);
        return;
    }
    events.Open(node);
    for (const XmlNode& child : node) {
        Replay(child, events);
    }
    events.Close();
}

}  // namespace

void ValueBuilder::Open(const XmlNode& element) {
    if (_passedOver > 0 || !Enter(element)) {
        ++_passedOver;
    }
}

void ValueBuilder::Leaf(const XmlNode& node) {
    const Place place = _open.back().place;
    if (_passedOver == 0 &&
        (place == Place::Int || place == Place::Bool || place == Place::String)) {
        _content = node.content.value_or(_content);
    } else if (XmlUtil_IsTagged(node)) {
        Open(node);
        Close();
    }
}

void ValueBuilder::Close() {
    if (_passedOver > 0) {
        --_passedOver;
        return;
    }
    const Frame frame = std::move(_open.back());
    _open.pop_back();
    if (auto value = Finish(frame)) {
        Deliver(std::move(value));
    }
}

// Does the element mean something at its place?
bool ValueBuilder::Enter(const XmlNode& element) {
    Frame& around = _open.back();
    switch (around.place) {
        case Place::Document:
            _hasRoot = true;
            _open.push_back({.place = Place::Root});
            return true;
        case Place::Structure:
            if (element.name != "field") {
                return false;
            }
            OpenField(element);
            return true;
        case Place::Root:
        case Place::Field:
        case Place::List:
            if (around.hasValue || !XmlUtil_IsTagged(element)) {
                return false;
            }
            around.hasValue = around.place != Place::List;
            OpenValue(element);
            return true;
        default:
            return false;
    }
}

void ValueBuilder::OpenField(const XmlNode& element) {
    const std::string_view name = XmlUtil_ExtractAttribute(element, "name");
    if (name.empty()) {
        throw ZelmarException("Invalid <field> tag found.  <field> requires a 'name' attribute.");
    }
    auto structure = _open.back().structure;
    _open.push_back(
        {.place = Place::Field, .name = std::string(name), .structure = std::move(structure)});
}

void ValueBuilder::OpenValue(const XmlNode& element) {
    _content.clear();
    if (element.name == "list") {
        BuildMetaList(element);
    } else if (element.name == "structure") {
        BuildMetaStruct(element);
    } else if (element.name == "int") {
        _open.push_back({.place = Place::Int});
    } else if (element.name == "bool") {
        _open.push_back({.place = Place::Bool});
    } else if (element.name == "string") {
        _open.push_back({.place = Place::String});
    } else {
        throw ZelmarException("Unable to make a MetaObject from a node with tag '" +
                              std::string(element.name) + "'");
    }
}

void ValueBuilder::BuildMetaList(const XmlNode& element) {
    const auto* row = std::ranges::find(listTypes, XmlUtil_ExtractAttribute(element, "type"),
                                        [](const auto& r) { return r.first; });
    if (row == std::end(listTypes)) {
        throw ZelmarException(
            "Invalid list type attribute.  Must be one of [string, int, bool, structure, list]");
    }
    const MetaType type = row->second;
    const bool needsShape = type == MetaType::Struct || type == MetaType::List;
    _open.push_back({.place = Place::List,
                     .listType = type,
                     .list = needsShape ? nullptr : MetaList::New(type)});
}

void ValueBuilder::BuildMetaStruct(const XmlNode& element) {
    auto structure = MetaStruct::New(std::string(XmlUtil_ExtractAttribute(element, "typeName")));
    _open.push_back({.place = Place::Structure, .structure = std::move(structure)});
}

// The value of the element that ends here, or null for one that only holds another's.
std::shared_ptr<MetaObject> ValueBuilder::Finish(const Frame& frame) const {
    switch (frame.place) {
        case Place::List:
            return frame.list ? frame.list
                              : MetaList::New(frame.listType, std::shared_ptr<MetaObject>());
        case Place::Structure:
            return frame.structure;
        case Place::Int:
            return ReadInt();
        case Place::Bool:
            return MetaBool::New(_content != "false" && _content != "f" && _content != "0");
        case Place::String:
            return MetaString::New(_content);
        default:
            return nullptr;
    }
}

std::shared_ptr<MetaObject> ValueBuilder::ReadInt() const {
    if (_content.empty()) {
        return MetaInt::New();
    }
    const auto number = ReadStreamInt(_content);
    if (!number) {
        throw ZelmarException("Unable to read an int value from: '" + _content + "'");
    }
    return MetaInt::New(*number);
}

void ValueBuilder::Deliver(std::shared_ptr<MetaObject> value) {
    Frame& around = _open.back();
    if (around.place == Place::Field) {
        around.structure->SetField(around.name, value);
    } else if (around.place == Place::Root) {
        _value = std::move(value);
    } else {
        if (!around.list) {
            around.list = MetaList::New(around.listType, CopyShape(value));
        }
        around.list->Add(value);
    }
}

std::shared_ptr<MetaObject> XmlUtil_BuildMetaObject(const XmlNode& node) {
    if (node.name == "text") {
        throw ZelmarException("Trying to make a meta object from a text field");
    }
    if (node.name == "comment") {
        throw ZelmarException("Trying to make a meta object from a comment");
    }
    ValueBuilder builder;
    builder.Open({.name = "output-spec"});
    Replay(node, builder);
    return builder.GetValue();
}

}  // namespace AutoCli
