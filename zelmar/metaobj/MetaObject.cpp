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

bool MetaObject::IsSameStructure(const std::shared_ptr<MetaObject>& other,
                                 std::vector<std::string>* errors) const {
    const bool isScalar =
        _type == MetaType::Int || _type == MetaType::Bool || _type == MetaType::String;
    if (other && isScalar && other->_type == _type) {
        return true;
    }
    if (errors) {
        errors->push_back("Type mismatch in structure.  Expecting " + MetaTypeString(_type) +
                          " got " + (other ? MetaTypeString(other->_type) : std::string()));
    }
    return false;
}

std::ostream& operator<<(std::ostream& out, const MetaObject& value) {
    return out << value.ToString();
}

}  // namespace MetaObj
