#pragma once

#include <zelmar/metaobj/MetaObject.h>

// What structs and lists share. Values may be nested deeper than the stack of a thread reaches:
// neither of these needs any of it for a level.

namespace MetaObj {

/// What `IsSameStructure` of `expected`, a struct or a list, answers.
bool CompareStructure(const MetaObject& expected, const std::shared_ptr<MetaObject>& other,
                      std::vector<std::string>* errors);

/// What `ToString` of a struct or a list gives.
std::string NestedText(const MetaObject& value);

}  // namespace MetaObj
