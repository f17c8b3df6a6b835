#pragma once

#include <zelmar/autocli/extension/XmlReader.h>
#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaStruct.h>

#include <memory>
#include <vector>

namespace AutoCli {

/// Makes a value out of the first element below the root of a document:
///
///     <int>7</int>  <bool>true</bool>  <string>text</string>
///     <structure typeName="Item"><field name="id"> value </field> ... </structure>
///     <list type="int|bool|string|structure"> values </list>
///
/// Of a scalar the last content counts. A field without a value is dropped. Throws
/// `ZelmarException`, with texts of its own and those of the value classes.
class ValueBuilder : public XmlEvents {
public:
    void Open(const XmlNode& element) override;
    void Close() override;
    void Leaf(const XmlNode& node) override;

    [[nodiscard]] bool HasRoot() const { return _hasRoot; }
    /// Null when there is no such element.
    [[nodiscard]] const std::shared_ptr<MetaObj::MetaObject>& GetValue() const { return _value; }

private:
    enum class Place { Document, Root, Field, List, Structure, Int, Bool, String };

    // An element that is open, and that counts.
    struct Frame {
        Place place;
        bool hasValue = false;  // of a root and a field, which take one
        std::string name = {};  // of a field
        MetaObj::MetaType listType = {};
        std::shared_ptr<MetaObj::MetaList> list = {};  // null until there is an item to go by
        std::shared_ptr<MetaObj::MetaStruct> structure = {};
    };

    bool Enter(const XmlNode& element);
    void OpenField(const XmlNode& element);
    void OpenValue(const XmlNode& element);
    void BuildMetaList(const XmlNode& element);
    void BuildMetaStruct(const XmlNode& element);
    [[nodiscard]] std::shared_ptr<MetaObj::MetaObject> Finish(const Frame& frame) const;
    [[nodiscard]] std::shared_ptr<MetaObj::MetaObject> ReadInt() const;
    void Deliver(std::shared_ptr<MetaObj::MetaObject> value);

    bool _hasRoot = false;
    std::vector<Frame> _open = {{.place = Place::Document}};
    size_t _passedOver = 0;  // open elements inside of one that means nothing at its place
    std::string _content;    // of the scalar that is open
    std::shared_ptr<MetaObj::MetaObject> _value;
};

/// The value that an element of a tree stands for.
[[nodiscard]] std::shared_ptr<MetaObj::MetaObject> XmlUtil_BuildMetaObject(const XmlNode& node);

}  // namespace AutoCli
