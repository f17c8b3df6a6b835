#include <zelmar/autocli/extension/Rethrow.h>
#include <zelmar/autocli/extension/StreamInt.h>
#include <zelmar/autocli/extension/XmlOutput.h>
#include <zelmar/autocli/extension/XmlUtil.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <libxml/parser.h>

#include <algorithm>
#include <limits>

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

MetaType ReadListType(const xmlNode* node) {
    const std::string word = XmlUtil_ExtractAttribute(node, "type");
    const auto* row = std::ranges::find(listTypes, word, [](const auto& r) { return r.first; });
    if (row == std::end(listTypes)) {
        throw ZelmarException(
            "Invalid list type attribute.  Must be one of [string, int, bool, structure, list]");
    }
    return row->second;
}

std::shared_ptr<MetaInt> BuildMetaInt(const xmlNode* node) {
    const std::string content = XmlUtil_GetContent(node);
    if (content.empty()) {
        return MetaInt::New();
    }
    const auto value = ReadStreamInt(content);
    if (!value) {
        throw ZelmarException("Unable to read an int value from: '" + content + "'");
    }
    return MetaInt::New(*value);
}

std::shared_ptr<MetaBool> BuildMetaBool(const xmlNode* node) {
    const std::string content = XmlUtil_GetContent(node);
    return MetaBool::New(content != "false" && content != "f" && content != "0");
}

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

// Building the first item of a list a second time for its shape would double at each level of
// nesting. A copy of the shape does not: of a list it takes the declaration and not the items.
std::shared_ptr<MetaObject> CopyShape(const std::shared_ptr<MetaObject>& value) {
    if (const auto* structure = MetaObj::MetaCast<MetaStruct>(value.get())) {
        return CopyShape(*structure);
    }
    const auto* list = MetaObj::MetaCast<MetaList>(value.get());
    return list ? CopyShape(*list) : value;
}

// The first child that stands for a value, or null.
const xmlNode* FindValue(const xmlNode* node) {
    const xmlNode* child = XmlUtil_GetFirstChild(node);
    while (child && !XmlUtil_IsTagged(child)) {
        child = child->next;
    }
    return child;
}

XmlDocument ParseText(std::string_view text) {
    constexpr size_t limit = std::numeric_limits<int>::max();
    if (text.size() > limit) {
        throw ZelmarException("Error parsing command output.  The output has " +
                              std::to_string(text.size()) + " bytes, more than the limit of " +
                              std::to_string(limit));
    }
    return XmlDocument(
        xmlReadMemory(text.data(), static_cast<int>(text.size()), "STDOUT", nullptr, 0));
}

}  // namespace

std::shared_ptr<MetaObject> XmlUtil_BuildMetaObject(const xmlNode* node) {
    const std::string_view tag = XmlUtil_GetName(node);
    if (tag == "text") {
        throw ZelmarException("Trying to make a meta object from a text field");
    }
    if (tag == "comment") {
        throw ZelmarException("Trying to make a meta object from a comment");
    }
    if (tag == "list") {
        return BuildMetaList(node);
    }
    if (tag == "structure") {
        return BuildMetaStruct(node);
    }
    if (tag == "int") {
        return BuildMetaInt(node);
    }
    if (tag == "bool") {
        return BuildMetaBool(node);
    }
    if (tag == "string") {
        return MetaString::New(XmlUtil_GetContent(node));
    }
    throw ZelmarException("Unable to make a MetaObject from a node with tag '" + std::string(tag) +
                          "'");
}

std::shared_ptr<MetaList> BuildMetaList(const xmlNode* node) {
    const MetaType type = ReadListType(node);
    std::shared_ptr<MetaList> list;
    if (type != MetaType::Struct && type != MetaType::List) {
        list = MetaList::New(type);
    }
    for (const xmlNode* child = FindValue(node); child; child = child->next) {
        if (XmlUtil_IsTagged(child)) {
            const auto item = XmlUtil_BuildMetaObject(child);
            if (!list) {
                list = MetaList::New(type, CopyShape(item));
            }
            list->Add(item);
        }
    }
    return list ? list : MetaList::New(type, std::shared_ptr<MetaObject>());
}

std::shared_ptr<MetaStruct> BuildMetaStruct(const xmlNode* node) {
    auto structure = MetaStruct::New(XmlUtil_ExtractAttribute(node, "typeName"));
    XmlUtil_ForEachChild(node, "field", [&structure](const xmlNode* field) {
        const std::string name = XmlUtil_ExtractAttribute(field, "name");
        if (name.empty()) {
            throw ZelmarException(
                "Invalid <field> tag found.  <field> requires a 'name' attribute.");
        }
        if (const xmlNode* value = FindValue(field)) {
            structure->SetField(name, XmlUtil_BuildMetaObject(value));
        }
    });
    return structure;
}

std::shared_ptr<MetaObject> XmlUtil_ParseXmlOutput(std::string_view text) {
    const XmlDocument document = ParseText(text);
    if (!document) {
        return nullptr;
    }
    const xmlNode* root = xmlDocGetRootElement(document.get());
    if (!root) {
        throw ZelmarException(
            "Error parsing command output.  Unable to find a properly formatted output tag as the"
            " document root");
    }
    const xmlNode* value = FindValue(root);
    if (!value) {
        return nullptr;
    }
    return WithContext(
        [] {
            return "Error parsing command output.  Unable to build a proper metaobject from output"
                   " tag.  output must contain properly formatted tags of type bool, int, string,"
                   " structure and list. Error was : ";
        },
        [&] {
            XmlUtil_CheckDeclarations(document.get());
            return XmlUtil_BuildMetaObject(value);
        });
}

}  // namespace AutoCli
