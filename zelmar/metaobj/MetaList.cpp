#include <zelmar/ZelmarException.h>
#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaScalars.h>
#include <zelmar/metaobj/Nested.h>

#include <boost/algorithm/string/join.hpp>

using Zelmar::ZelmarException;

namespace MetaObj {

namespace {

bool Refuse(std::vector<std::string>* errors, std::string message) {
    if (errors) {
        errors->push_back(std::move(message));
    }
    return false;
}

template <class Values>
void AddEach(MetaList& list, const Values& values) {
    list.EnsureCapacity(values.size());
    for (const auto& value : values) {
        list.Add(value);
    }
}

}  // namespace

MetaList::MetaList(MetaType type, FactoryFlag flag) : MetaObject(kind, flag), _listType(type) {
    if (type == MetaType::Struct || type == MetaType::List) {
        throw ZelmarException("Integer, boolean or string type expected for list.");
    }
}

MetaList::MetaList(MetaType type, std::shared_ptr<MetaStruct> structure, FactoryFlag flag)
    : MetaObject(kind, flag), _listStructure(std::move(structure)), _listType(type) {
    if (type != MetaType::Struct) {
        throw ZelmarException("Struct type expected for list.");
    }
    if (_listStructure) {
        _listStructure->LockStructure();
    }
}

MetaList::~MetaList() {
    for (auto& object : _objects) {
        MetaStruct::Release(std::move(object));
    }
    MetaStruct::Release(std::move(_listStructure));
}

std::shared_ptr<MetaList> MetaList::New(MetaType type) {
    return std::make_shared<MetaList>(type, FactoryFlag());
}

std::shared_ptr<MetaList> MetaList::New(MetaType type,
                                        const std::shared_ptr<MetaStruct>& structure) {
    return New(type, std::shared_ptr<MetaStruct>(structure));
}

std::shared_ptr<MetaList> MetaList::New(MetaType type, std::shared_ptr<MetaStruct>&& structure) {
    return std::make_shared<MetaList>(type, std::move(structure), FactoryFlag());
}

std::shared_ptr<MetaList> MetaList::New(MetaType type,
                                        const std::shared_ptr<MetaObject>& structure) {
    return New(type, std::dynamic_pointer_cast<MetaStruct>(structure));
}

std::shared_ptr<MetaObject> MetaList::GetItem(uint32_t index) const {
    if (index >= _objects.size()) {
        throw ZelmarException("Get requested on invalid index of MetaList");
    }
    return _objects[index];
}

void MetaList::Add(const std::shared_ptr<MetaObject>& item) {
    if (!item) {
        throw ZelmarException("Null object passed to Add");
    }
    if (item->GetType() != _listType) {
        throw ZelmarException("Invalid type specificed in MetaList.  Expected object of type " +
                              MetaTypeString(_listType) + " got object of type " +
                              MetaTypeString(item->GetType()));
    }
    std::vector<std::string> errors;
    if (!Validate(item, &errors)) {
        throw ZelmarException("Invalid structure detected by MetaList::Add.  Type Errors were: (" +
                              std::to_string(errors.size()) +
                              ") : " + boost::algorithm::join(errors, ", "));
    }
    _objects.push_back(item);
}

void MetaList::Add(bool value) {
    Add(std::shared_ptr<MetaObject>(MetaBool::New(value)));
}

void MetaList::Add(long value) {
    Add(std::shared_ptr<MetaObject>(MetaInt::New(value)));
}

void MetaList::Add(int value) {
    Add(static_cast<long>(value));
}

void MetaList::Add(const char* value) {
    Add(std::string(value));
}

void MetaList::Add(const std::string& value) {
    Add(std::string(value));
}

void MetaList::Add(std::string&& value) {
    Add(std::shared_ptr<MetaObject>(MetaString::New(std::move(value))));
}

void MetaList::AddAll(const std::vector<bool>& values) {
    AddEach(*this, values);
}

void MetaList::AddAll(const std::vector<long>& values) {
    AddEach(*this, values);
}

void MetaList::AddAll(const std::vector<std::string>& values) {
    AddEach(*this, values);
}

void MetaList::AddAll(std::vector<std::string>&& values) {
    EnsureCapacity(values.size());
    for (std::string& value : values) {
        Add(std::move(value));
    }
}

void MetaList::Delete(uint32_t index) {
    if (index >= _objects.size()) {
        throw ZelmarException("Delete requested on invalid index of MetaList");
    }
    _objects.erase(_objects.begin() + index);
}

void MetaList::EnsureCapacity(size_t count) {
    _objects.reserve(_objects.size() + count);
}

bool MetaList::Validate(const std::shared_ptr<MetaObject>& item,
                        std::vector<std::string>* errors) const {
    if (!item) {
        return Refuse(errors, "Invalid NULL input");
    }
    if (item->GetType() != _listType) {
        return Refuse(errors,
                      "There was an error adding an item to this list.  The item being added was"
                      " not the correct type for this list, so it was not added.");
    }
    if (_listType != MetaType::Struct) {
        return true;
    }
    if (!_listStructure) {
        return Refuse(errors,
                      "List created with NULL structure.  No items can be added to this"
                      " list.");
    }
    if (_listStructure->IsSameStructure(item, errors)) {
        return true;
    }
    return Refuse(errors,
                  "There was an error adding an item to this list.  The item being added did not"
                  " match the declared structure of this list, so it was not added.");
}

bool MetaList::IsSameStructure(const std::shared_ptr<MetaObject>& other,
                               std::vector<std::string>* errors) const {
    return CompareStructure(*this, other, errors);
}

std::string MetaList::ToString() const {
    return NestedText(*this);
}

}  // namespace MetaObj
