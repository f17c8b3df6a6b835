#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <gtest/gtest.h>

using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

// What called itself once a level would overflow the stack at this depth.
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

std::shared_ptr<MetaStruct> NestedAround(std::shared_ptr<MetaObject> value) {
    for (int level = 0; level < levels; ++level) {
        auto around = MetaStruct::New("Level");
        around->SetField("in", value);
        value = around;
    }
    return std::static_pointer_cast<MetaStruct>(value);
}

TEST(DeepValues, ArePrintedAndComparedLevelByLevel) {
    const auto number = NestedAround(MetaObj::MetaInt::New(1));
    std::string text;
    std::string end;
    std::vector<std::string> complaints;
    for (int level = 0; level < levels; ++level) {
        text += "{'in' => '";
        end += "', }";
        complaints.emplace_back("Type mismatch on field: in");
    }
    EXPECT_TRUE(number->ToString() == text + "1" + end);
    EXPECT_TRUE(number->IsSameStructure(number, nullptr));

    complaints.emplace_back("List type mismatch list and input");
    std::vector<std::string> errors;
    const auto numbers = MetaList::New(MetaType::Struct, number);
    const auto truths = MetaList::New(MetaType::Struct, NestedAround(MetaObj::MetaBool::New()));
    EXPECT_FALSE(numbers->IsSameStructure(truths, &errors));
    EXPECT_EQ(errors, complaints);
}
