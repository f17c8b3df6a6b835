#pragma once

#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <map>
#include <string>

// The values that every formatter is fed.

using Value = std::shared_ptr<MetaObj::MetaObject>;

/// By name.
std::map<std::string, Value> SampleValues();

/// A struct in a struct, `levels` deep, around the text "core".
Value NestedStructs(int levels);

/// A value whose class does not fit its kind, as only a host's own class can be.
class Misfit final : public MetaObj::MetaObject {
public:
    explicit Misfit(MetaObj::MetaType kind) : MetaObject(kind, FactoryFlag()) {}
    [[nodiscard]] std::string ToString() const override { return "misfit"; }
};
