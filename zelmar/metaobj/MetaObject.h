#pragma once

#include <zelmar/Export.h>

#include <iosfwd>
#include <memory>
#include <string>
#include <typeinfo>
#include <vector>

namespace MetaObj {

/// The kinds of value. The numbers are fixed.
enum class MetaType : int { Int, Bool, String, Struct, List };

/// The word for a kind in messages: "Int", "Bool", "String", "Struct", "List"; empty for any other
/// number. The string lives as long as the library.
ZELMAR_EXPORT const std::string& MetaTypeString(const MetaType& type);

/// A self-describing value: what commands return and how they declare the shape of what they
/// return. Values are made by the static `New` of the concrete classes and held by shared pointers.
/// A value that no longer changes may be read, shared and let go of in any number of threads; while
/// it is built it belongs to one. Only memory bounds how deep values are nested.
class ZELMAR_EXPORT MetaObject {
public:
    /// Marks the constructors that only the `New` factories mean to call.
    struct FactoryFlag {};

    MetaObject(const MetaObject&) = delete;
    MetaObject& operator=(const MetaObject&) = delete;

    [[nodiscard]] MetaType GetType() const { return _type; }

    /// Has `other` the shape of this value? This value is what is expected, `other` is under test.
    /// Reasons are appended to `errors` unless that is null; a null `other` answers false. For the
    /// scalars the kind is the whole shape: 5 has the same structure as 7. A kind outside the five
    /// has the shape of nothing, unless its class says otherwise.
    virtual bool IsSameStructure(const std::shared_ptr<MetaObject>& other,
                                 std::vector<std::string>* errors) const;

    /// The value as plain text, without quotes or escapes.
    [[nodiscard]] virtual std::string ToString() const = 0;

protected:
    MetaObject(MetaType type, FactoryFlag) : _type(type) {}

    // Not virtual: a value dies through the shared pointer that its factory made.
    ~MetaObject() = default;

private:
    const MetaType _type;
};

/// Writes `ToString()` of the value, nothing else.
ZELMAR_EXPORT std::ostream& operator<<(std::ostream& out, const MetaObject& value);

/// The value as its concrete class, or null when it is null or of another class. A cheap
/// `dynamic_cast`: the concrete classes are final.
template <class Value>
[[nodiscard]] const Value* MetaCast(const MetaObject* value) {
    // The kind goes first, for it costs less than to find two classes different.
    return value && value->GetType() == Value::kind && typeid(*value) == typeid(Value)
               ? static_cast<const Value*>(value)
               : nullptr;
}

}  // namespace MetaObj
