#include <zelmar/ZelmarException.h>
#include <zelmar/internal/Ascii.h>
#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaScalars.h>
#include <zelmar/metaobj/MetaStruct.h>
#include <zelmar/metaobj/Nested.h>

using Zelmar::ZelmarException;

namespace MetaObj {

namespace {

template <class Values>
std::shared_ptr<MetaList> ListOf(MetaType type, Values&& values) {
    auto list = MetaList::New(type);
    list->AddAll(std::forward<Values>(values));
    return list;
}

}  // namespace

const std::string MetaStruct::_docEmpty;
const std::string MetaStruct::_docMissingStaticString = "Documentation missing";

bool IsValidStructName(const std::string& name) {
    return Ascii::ConsistsOf(name, Ascii::IsAlnum);
}

bool IsValidFieldName(const std::string& /*name*/) {
    return true;
}

MetaStruct::MetaStruct(std::string&& typeName, FactoryFlag flag)
    : MetaObject(kind, flag), _typeName(std::move(typeName)) {
    if (!IsValidStructName(_typeName)) {
        throw ZelmarException("Invalid name specified for MetaStruct: " + _typeName);
    }
}

MetaStruct::MetaStruct(const std::shared_ptr<MetaStruct>& definition, FactoryFlag flag)
    : MetaObject(kind, flag), _structureDefinition(definition), _typeName(definition->_typeName) {
    definition->LockStructure();
}

MetaStruct::~MetaStruct() {
    for (auto& [name, field] : _fields) {
        Release(std::move(field.value));
    }
    Release(std::move(_structureDefinition));
}

namespace {

// Values that are going at present, one within the other.
struct Dying {
    int depth = 1;
    std::shared_ptr<MetaStruct> waiting;  // the first of those that wait for their turn
};

thread_local Dying* dying = nullptr;  // null where none is

}  // namespace

// At an ordinary depth a value goes within the destructor of the one around it. Those further in
// wait, each linked to the next, until the stack of the thread is free of the ones around them.
// Structs alone need to: what a list holds are scalars and structs.
void MetaStruct::Release(std::shared_ptr<MetaObject>&& value) {
    constexpr int ordinaryDepth = 8;
    if (!value || (value->GetType() != MetaType::Struct && value->GetType() != MetaType::List)) {
        return;
    }
    if (!dying) {
        Dying outermost;
        dying = &outermost;
        value.reset();
        while (const auto next = std::move(outermost.waiting)) {
            outermost.waiting = std::move(next->_waitsBehind);
        }
        dying = nullptr;
    } else if (dying->depth >= ordinaryDepth && value.use_count() == 1 &&
               MetaCast<MetaStruct>(value.get())) {
        auto last = std::static_pointer_cast<MetaStruct>(std::move(value));
        last->_waitsBehind = std::move(dying->waiting);
        dying->waiting = std::move(last);
    } else {
        ++dying->depth;
        value.reset();
        --dying->depth;
    }
}

std::shared_ptr<MetaStruct> MetaStruct::New(const std::string& typeName) {
    return New(std::string(typeName));
}

std::shared_ptr<MetaStruct> MetaStruct::New(std::string&& typeName) {
    return std::make_shared<MetaStruct>(std::move(typeName), FactoryFlag());
}

std::shared_ptr<MetaStruct> MetaStruct::New(const char* typeName) {
    return New(std::string(typeName));
}

std::shared_ptr<MetaStruct> MetaStruct::New(const std::shared_ptr<MetaStruct>& definition) {
    return std::make_shared<MetaStruct>(definition, FactoryFlag());
}

std::shared_ptr<MetaStruct> MetaStruct::GetStructureDefinition() const {
    return _structureDefinition;
}

bool MetaStruct::MatchesStructureDefinition() const {
    return !_structureDefinition || IsSameStructure(_structureDefinition, nullptr);
}

void MetaStruct::SetField(const std::string& name, const std::shared_ptr<MetaObject>& value,
                          const std::string& documentation) {
    Store(name, value, documentation);
}

void MetaStruct::SetField(const std::string& name, long value) {
    Store(name, MetaInt::New(value), _docEmpty);
}

void MetaStruct::SetField(const std::string& name, int value) {
    Store(name, MetaInt::New(value), _docEmpty);
}

void MetaStruct::SetField(const std::string& name, bool value) {
    Store(name, MetaBool::New(value), _docEmpty);
}

void MetaStruct::SetField(const std::string& name, const std::string& value) {
    Store(name, MetaString::New(value), _docEmpty);
}

void MetaStruct::SetField(const std::string& name, std::string&& value) {
    Store(name, MetaString::New(std::move(value)), _docEmpty);
}

void MetaStruct::SetField(const std::string& name, const char* value) {
    Store(name, MetaString::New(value), _docEmpty);
}

void MetaStruct::SetField(const std::string& name, const std::vector<std::string>& values) {
    Store(name, ListOf(MetaType::String, values), _docEmpty);
}

void MetaStruct::SetField(const std::string& name, std::vector<std::string>&& values) {
    Store(name, ListOf(MetaType::String, std::move(values)), _docEmpty);
}

void MetaStruct::SetField(const std::string& name, const std::vector<long>& values) {
    Store(name, ListOf(MetaType::Int, values), _docEmpty);
}

void MetaStruct::SetField(const std::string& name, const std::vector<bool>& values) {
    Store(name, ListOf(MetaType::Bool, values), _docEmpty);
}

void MetaStruct::Store(const std::string& name, std::shared_ptr<MetaObject> value,
                       const std::string& documentation) {
    if (!value) {
        throw ZelmarException("Invalid NULL value was assigned to the field " + name +
                              " in the structure " + _typeName);
    }
    const auto place = _fields.lower_bound(name);
    if (place != _fields.end() && place->first == name) {
        place->second = Field(std::move(value), documentation);
    } else {
        RequireNewFieldAllowed(name);
        _fields.emplace_hint(place, std::piecewise_construct, std::forward_as_tuple(name),
                             std::forward_as_tuple(std::move(value), documentation));
    }
}

// A field that exists needs no such test: it can only have come in by passing it.
void MetaStruct::RequireNewFieldAllowed(const std::string& name) const {
    if (_locked) {
        throw ZelmarException("Unable to set new field " + name +
                              " on structure. Structure has been locked");
    }
    if (_structureDefinition && !_structureDefinition->HasField(name)) {
        throw ZelmarException("Unable to set new field " + name +
                              " on structure.  The field does not match the Structure definition"
                              " for this MetaStruct.");
    }
}

bool MetaStruct::HasField(const std::string& name) const {
    return _fields.contains(name);
}

std::shared_ptr<MetaObject> MetaStruct::GetField(const std::string& name) const {
    const auto field = _fields.find(name);
    return field == _fields.end() ? nullptr : field->second.value;
}

std::vector<std::string> MetaStruct::GetFieldNames() const {
    std::vector<std::string> names;
    names.reserve(_fields.size());
    for (const auto& [name, field] : _fields) {
        names.push_back(name);
    }
    return names;
}

const std::string& MetaStruct::GetFieldDocumentation(const std::string& name) const {
    const auto field = _fields.find(name);
    if (field == _fields.end()) {
        throw ZelmarException("Field " + name + " is not present in the structure " + _typeName);
    }
    const std::string& documentation = field->second.documentation;
    return documentation.empty() ? _docMissingStaticString : documentation;
}

MetaType MetaStruct::GetFieldType(const std::string& name) const {
    const auto field = _fields.find(name);
    if (field == _fields.end()) {
        throw 1;
    }
    return field->second.value->GetType();
}

void MetaStruct::RemoveField(const std::string& name) {
    if (_locked) {
        throw ZelmarException("Structure is locked, unable to remove fields");
    }
    _fields.erase(name);
}

bool MetaStruct::IsSameStructure(const std::shared_ptr<MetaObject>& other,
                                 std::vector<std::string>* errors) const {
    return CompareStructure(*this, other, errors);
}

std::string MetaStruct::ToString() const {
    return NestedText(*this);
}

}  // namespace MetaObj
