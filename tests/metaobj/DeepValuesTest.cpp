#include <zelmar/metaobj/MetaList.h>

#include <gtest/gtest.h>

using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

// Destructors that called each other would overflow the stack at this depth.
constexpr int levels = 100000;

// A struct in the declaration of a list, in a list, in a struct.
TEST(DeepValues, DieLevelByLevel) {
    auto value = MetaStruct::New("Level");
    const std::weak_ptr<MetaStruct> innermost = value;
    for (int level = 0; level < levels; ++level) {
        auto lists = std::make_shared<MetaList>(MetaType::List, nullptr, MetaObject::FactoryFlag());
        lists->Add(MetaList::New(MetaType::Struct, value));
        value = MetaStruct::New("Level");
        value->SetField("in", lists);
    }
    value.reset();
    EXPECT_TRUE(innermost.expired());
}

TEST(DeepValues, DefinitionsDieOneByOne) {
    auto value = MetaStruct::New("Level");
    const std::weak_ptr<MetaStruct> innermost = value;
    for (int level = 0; level < levels; ++level) {
        value = MetaStruct::New(value);
    }
    value.reset();
    EXPECT_TRUE(innermost.expired());
}
