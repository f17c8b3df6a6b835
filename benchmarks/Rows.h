#pragma once

// The values that benchmarks print and build: structs of six fields, of all scalar kinds.

#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaStruct.h>

#include <memory>
#include <string>

namespace Rows {

/// The text fields of a row, made before any clock runs.
struct Texts {
    explicit Texts(long row)
        : device("/dev/mapper/vg0-volume" + std::to_string(row)),
          path("/srv/projects/" + std::to_string(row % 1000) + "/data"),
          type(row % 3 == 0 ? "xfs" : "ext4") {}

    std::string device;
    std::string path;
    std::string type;
};

inline std::shared_ptr<MetaObj::MetaStruct> Definition() {
    auto definition = MetaObj::MetaStruct::New("Mount");
    definition->SetField("device", "");
    definition->SetField("path", "");
    definition->SetField("readonly", false);
    definition->SetField("size", 0);
    definition->SetField("type", "");
    definition->SetField("used", 0);
    return definition;
}

inline void Add(MetaObj::MetaList& list, long row, const Texts& texts) {
    auto item = MetaObj::MetaStruct::New(list.GetListStructure());
    item->SetField("device", texts.device);
    item->SetField("path", texts.path);
    item->SetField("readonly", row % 2 == 0);
    item->SetField("size", 4096 * row);
    item->SetField("type", texts.type);
    item->SetField("used", 1000 + row);
    list.Add(item);
}

inline std::shared_ptr<MetaObj::MetaList> Make(long count) {
    auto list = MetaObj::MetaList::New(MetaObj::MetaType::Struct, Definition());
    for (long row = 0; row < count; ++row) {
        Add(*list, row, Texts(row));
    }
    return list;
}

}  // namespace Rows
