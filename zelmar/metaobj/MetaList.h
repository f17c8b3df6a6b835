#pragma once

#include <zelmar/metaobj/MetaStruct.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace MetaObj {

/// A sequence of values of one declared kind: scalars of one type, or structs of one shape. Every
/// item is checked when it is added, so that readers can trust the declaration and need not look at
/// the items. A list of lists cannot be made.
class ZELMAR_EXPORT MetaList final : public MetaObject {
public:
    static constexpr MetaType kind = MetaType::List;

    MetaList(MetaType type, FactoryFlag flag);
    MetaList(MetaType type, std::shared_ptr<MetaStruct> structure, FactoryFlag flag);
    ~MetaList();

    /// A list of scalars. Throws `ZelmarException` for another kind: "Integer, boolean or string
    /// type expected for list."
    static std::shared_ptr<MetaList> New(MetaType type);

    /// A list of structs of the shape of `structure`, which is locked from now on. Items need not
    /// be made from it. A null structure, or in the third form a value that is no struct, gives a
    /// list that refuses every item. Throws `ZelmarException` when `type` is not Struct: "Struct
    /// type expected for list."
    static std::shared_ptr<MetaList> New(MetaType type,
                                         const std::shared_ptr<MetaStruct>& structure);
    static std::shared_ptr<MetaList> New(MetaType type, std::shared_ptr<MetaStruct>&& structure);
    static std::shared_ptr<MetaList> New(MetaType type,
                                         const std::shared_ptr<MetaObject>& structure);

    [[nodiscard]] MetaType GetListType() const { return _listType; }
    /// Null for a list of scalars.
    [[nodiscard]] const std::shared_ptr<MetaStruct>& GetListStructure() const {
        return _listStructure;
    }
    [[nodiscard]] const std::vector<std::shared_ptr<MetaObject>>& GetObjects() const {
        return _objects;
    }
    [[nodiscard]] uint32_t GetCount() const { return static_cast<uint32_t>(_objects.size()); }

    /// The index must lie below the count; it is not checked.
    const std::shared_ptr<MetaObject>& operator[](uint32_t index) const { return _objects[index]; }
    /// Throws `ZelmarException`: "Get requested on invalid index of MetaList".
    [[nodiscard]] std::shared_ptr<MetaObject> GetItem(uint32_t index) const;

    /// Appends one item, shared and not copied. Throws `ZelmarException`, and leaves the list as it
    /// was: "Null object passed to Add"; "Invalid type specificed in MetaList.  Expected object of
    /// type <kind> got object of type <kind>"; "Invalid structure detected by MetaList::Add.  Type
    /// Errors were: (<count>) : <messages of Validate, joined by ", ">".
    void Add(const std::shared_ptr<MetaObject>& item);
    void Add(bool value);
    void Add(long value);
    void Add(int value);
    void Add(const char* value);
    void Add(const std::string& value);
    void Add(std::string&& value);

    /// Appends the values in order. What was added before a failure stays.
    void AddAll(const std::vector<bool>& values);
    void AddAll(const std::vector<long>& values);
    void AddAll(const std::vector<std::string>& values);
    void AddAll(std::vector<std::string>&& values);

    /// The later items move down by one. Throws `ZelmarException`: "Delete requested on invalid
    /// index of MetaList".
    void Delete(uint32_t index);

    /// Makes room for `count` items beyond those that are there.
    void EnsureCapacity(size_t count);
    /// Makes room for `count` items in all.
    void Reserve(size_t count) { _objects.reserve(count); }

    /// Would `Add` take the item, by its shape? Reasons are appended to `errors` unless that is
    /// null; a struct of the right shape and another type name leaves one and is taken.
    bool Validate(const std::shared_ptr<MetaObject>& item, std::vector<std::string>* errors) const;

    /// Compares the declarations of two lists and never their items.
    bool IsSameStructure(const std::shared_ptr<MetaObject>& other,
                         std::vector<std::string>* errors) const override;

    /// The items joined by ", ", without brackets.
    [[nodiscard]] std::string ToString() const override;

private:
    std::shared_ptr<MetaStruct> _listStructure;
    std::vector<std::shared_ptr<MetaObject>> _objects;
    MetaType _listType;
};

}  // namespace MetaObj
