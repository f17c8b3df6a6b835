#pragma once

#include <zelmar/metaobj/MetaScalars.h>

#include <map>
#include <string>
#include <utility>
#include <vector>

namespace MetaObj {

/// The rule on a struct's type name: ASCII letters and digits, at least one.
ZELMAR_EXPORT bool IsValidStructName(const std::string& name);

/// Field names are free: they may hold blanks and may be empty.
ZELMAR_EXPORT bool IsValidFieldName(const std::string& name);

/// A record: a type name and named fields, each of any value. Fields stand in ascending byte order
/// of their names, whatever the order they were set in.
///
/// A struct can serve as the definition of others: it declares their field names, and its values
/// are samples of which only the kinds count. Its first use as a definition locks it: fields can
/// then be neither added nor removed, only their values replaced. A struct made from a definition
/// takes no field outside it; `MatchesStructureDefinition` tells whether it is complete and of the
/// right kinds, which nothing checks by itself.
class ZELMAR_EXPORT MetaStruct final : public MetaObject {
public:
    static constexpr MetaType kind = MetaType::Struct;

    /// What a struct holds under one name. The value of a stored field is never null.
    struct ZELMAR_EXPORT Field {
        Field(std::shared_ptr<MetaObject> fieldValue, std::string fieldDocumentation)
            : value(std::move(fieldValue)), documentation(std::move(fieldDocumentation)) {}
        Field& operator=(Field&& other) noexcept {
            value = std::move(other.value);
            documentation.swap(other.documentation);
            return *this;
        }

        std::shared_ptr<MetaObject> value;
        std::string documentation;
    };

    /// The documentation of a field that was set without any.
    static const std::string _docEmpty;
    /// What `GetFieldDocumentation` answers for such a field: "Documentation missing".
    static const std::string _docMissingStaticString;

    MetaStruct(std::string&& typeName, FactoryFlag flag);
    MetaStruct(const std::shared_ptr<MetaStruct>& definition, FactoryFlag flag);
    ~MetaStruct();

    /// A struct of that type name, without a definition. Throws `ZelmarException`:
    /// "Invalid name specified for MetaStruct: <name>".
    static std::shared_ptr<MetaStruct> New(const std::string& typeName);
    static std::shared_ptr<MetaStruct> New(std::string&& typeName);
    static std::shared_ptr<MetaStruct> New(const char* typeName);

    /// A struct without fields, made from `definition` (not null), which is locked from now on and
    /// shared by all that are made from it.
    static std::shared_ptr<MetaStruct> New(const std::shared_ptr<MetaStruct>& definition);

    [[nodiscard]] const std::string& GetTypeName() const { return _typeName; }
    [[nodiscard]] bool HasStructureDefinition() const { return _structureDefinition != nullptr; }
    /// Null when there is none.
    [[nodiscard]] std::shared_ptr<MetaStruct> GetStructureDefinition() const;

    /// Are all fields of the definition set, and with values of its kinds? True without one.
    [[nodiscard]] bool MatchesStructureDefinition() const;

    /// Freezes the set of field names, for good.
    void LockStructure() { _locked = true; }

    /// Creates or replaces a field. The value is shared, not copied. Throws `ZelmarException`, and
    /// changes nothing: "Invalid NULL value was assigned to the field <name> in the structure
    /// <typeName>"; "Unable to set new field <name> on structure. Structure has been locked";
    /// "Unable to set new field <name> on structure.  The field does not match the Structure
    /// definition for this MetaStruct."
    void SetField(const std::string& name, const std::shared_ptr<MetaObject>& value,
                  const std::string& documentation = _docEmpty);

    /// The same with the value made on the spot: a scalar, or a list of scalars. Clears the
    /// documentation, as does the form above without it.
    void SetField(const std::string& name, long value);
    void SetField(const std::string& name, int value);
    void SetField(const std::string& name, bool value);
    template <std::integral Integer>
    void SetField(const std::string& name, Integer value) {
        SetField(name, FitInteger(value));
    }
    void SetField(const std::string& name, const std::string& value);
    void SetField(const std::string& name, std::string&& value);
    void SetField(const std::string& name, const char* value);
    void SetField(const std::string& name, const std::vector<std::string>& values);
    void SetField(const std::string& name, std::vector<std::string>&& values);
    void SetField(const std::string& name, const std::vector<long>& values);
    void SetField(const std::string& name, const std::vector<bool>& values);

    /// Every form above, for a zero-terminated name.
    template <class Value>
    void SetField(const char* name, Value&& value) {
        SetField(std::string(name), std::forward<Value>(value));
    }

    [[nodiscard]] bool HasField(const std::string& name) const;
    /// Null when the field is absent.
    [[nodiscard]] std::shared_ptr<MetaObject> GetField(const std::string& name) const;
    [[nodiscard]] std::vector<std::string> GetFieldNames() const;
    /// All fields by name, without a copy. The reference lives as long as the struct.
    [[nodiscard]] const std::map<std::string, Field>& GetFields() const { return _fields; }

    /// Throws `ZelmarException` for an absent field: "Field <name> is not present in the structure
    /// <typeName>".
    [[nodiscard]] const std::string& GetFieldDocumentation(const std::string& name) const;
    /// The kind of the field's value. Throws the integer 1 for an absent field.
    [[nodiscard]] MetaType GetFieldType(const std::string& name) const;

    /// An absent field is no failure. Throws `ZelmarException` on a locked struct: "Structure is
    /// locked, unable to remove fields".
    void RemoveField(const std::string& name);

    /// Same number of fields, each under a name of this struct and of the same shape. Another type
    /// name leaves a message but does not change the answer.
    bool IsSameStructure(const std::shared_ptr<MetaObject>& other,
                         std::vector<std::string>* errors) const override;

    /// `{'<name>' => '<value>', }`, with nothing escaped; "{}" without fields.
    [[nodiscard]] std::string ToString() const override;

private:
    friend class MetaList;

    // Lets go of a value within another one that dies, without any memory, and with little of the
    // stack however deep values are nested.
    static void Release(std::shared_ptr<MetaObject>&& value);

    using Fields = std::map<std::string, Field>;

    void Store(const std::string& name, std::shared_ptr<MetaObject> value,
               const std::string& documentation);
    void RequireNewFieldAllowed(const std::string& name) const;

    Fields _fields;
    std::shared_ptr<MetaStruct> _structureDefinition;
    std::string _typeName;
    bool _locked = false;
    std::shared_ptr<MetaStruct> _waitsBehind;  // used while values die
};

}  // namespace MetaObj
