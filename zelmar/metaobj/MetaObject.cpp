#include <zelmar/metaobj/MetaObject.h>

#include <array>
#include <ostream>

namespace MetaObj {

const std::string& MetaTypeString(const MetaType& type) {
    static const std::array<std::string, 5> words = {"Int", "Bool", "String", "Struct", "List"};
    static const std::string none;
    const auto index = static_cast<size_t>(type);
    return index < words.size() ? words[index] : none;
}

namespace {

bool IsScalar(const MetaObject& value) {
    return value.GetType() != MetaType::Struct && value.GetType() != MetaType::List;
}

}  // namespace

bool MetaObject::IsSameStructure(const std::shared_ptr<MetaObject>& other,
                                 std::vector<std::string>* errors) const {
    if (other && IsScalar(*this) && other->_type == _type) {
        return true;
    }
    if (errors) {
        errors->push_back("Type mismatch in structure.  Expecting " + MetaTypeString(_type) +
                          " got " + (other ? MetaTypeString(other->_type) : std::string()));
    }
    return false;
}

void MetaObject::Release(std::shared_ptr<MetaObject>&& value) {
    if (!value || IsScalar(*value)) {
        return;
    }
    thread_local std::vector<std::shared_ptr<MetaObject>>* waiting = nullptr;
    if (waiting) {
        waiting->push_back(std::move(value));
        return;
    }
    std::vector<std::shared_ptr<MetaObject>> values;
    waiting = &values;
    value.reset();
    while (!values.empty()) {
        const auto next = std::move(values.back());
        values.pop_back();
    }
    waiting = nullptr;
}

std::ostream& operator<<(std::ostream& out, const MetaObject& value) {
    return out << value.ToString();
}

}  // namespace MetaObj
