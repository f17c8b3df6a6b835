#include <tests/support/Thrown.h>
#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaScalars.h>
#include <zelmar/metaobj/MetaStruct.h>

#include <gtest/gtest.h>

namespace MetaObj {
namespace {

using Struct = std::shared_ptr<MetaStruct>;
using Names = std::vector<std::string>;
using Values = std::vector<std::pair<const char*, std::shared_ptr<MetaObject>>>;

Struct Make(const char* type, const Values& values) {
    auto structure = MetaStruct::New(type);
    for (const auto& [name, value] : values) {
        structure->SetField(name, value);
    }
    return structure;
}

// The answer of a comparison and its messages; without a place for messages it is the same.
std::string Compare(const MetaObject& expected, const std::shared_ptr<MetaObject>& other) {
    std::vector<std::string> errors;
    const bool same = expected.IsSameStructure(other, &errors);
    EXPECT_EQ(expected.IsSameStructure(other, nullptr), same);
    std::string text = same ? "same" : "differs";
    for (const std::string& error : errors) {
        text += "\n" + error;
    }
    return text;
}

TEST(Struct, TypeNamesAreLettersAndDigits) {
    for (const char* name : {"a", "Z", "9", "0aB"}) {
        EXPECT_EQ(MetaStruct::New(name)->GetTypeName(), name);
    }
    for (const char* name : {"", "a b", "a_b", "a.b", "a\n", "\xc3\xa4"}) {
        EXPECT_EQ(Thrown([name] { (void)MetaStruct::New(name); }),
                  std::string("Invalid name specified for MetaStruct: ") + name);
    }
}

TEST(Struct, TakesEveryKindOfValueUnderAnyName) {
    auto structure = MetaStruct::New("T");
    structure->SetField("", "text");
    structure->SetField("Short Name", std::string("moved"));
    structure->SetField("a.b", Names({"x", "y"}));
    structure->SetField("Z", std::vector<long>({1, -2}));
    structure->SetField("bits", std::vector<bool>({true, false}));
    structure->SetField("i", 3);
    structure->SetField("l", 1L << 40);
    structure->SetField("t", true);
    structure->SetField("s", Make("Inner", {{"n", MetaInt::New(1)}}));
    EXPECT_EQ(structure->ToString(),
              "{'' => 'text', 'Short Name' => 'moved', 'Z' => '1, -2', 'a.b' => 'x, y',"
              " 'bits' => 'true, false', 'i' => '3', 'l' => '1099511627776',"
              " 's' => '{'n' => '1', }', 't' => 'true', }");
    EXPECT_EQ(structure->GetFieldType("bits"), MetaType::List);
    EXPECT_EQ(MetaStruct::New("T")->ToString(), "{}");
}

TEST(Struct, AnAbsentFieldIsNullWithoutDocumentationOrType) {
    auto structure = MetaStruct::New("T");
    structure->SetField("a", MetaInt::New(1), "What a is.");
    EXPECT_EQ(structure->GetFieldDocumentation("a"), "What a is.");
    structure->SetField("a", 2);
    EXPECT_EQ(structure->GetFieldDocumentation("a"), "Documentation missing");
    EXPECT_EQ(structure->GetField("b"), nullptr);
    EXPECT_FALSE(structure->HasField("b"));
    EXPECT_EQ(Thrown([&] { (void)structure->GetFieldDocumentation("b"); }),
              "Field b is not present in the structure T");
    EXPECT_THROW((void)structure->GetFieldType("b"), int);
    structure->RemoveField("b");
    structure->RemoveField("a");
    EXPECT_EQ(structure->GetFieldNames(), Names());
}

TEST(Struct, ALockedStructKeepsItsFieldNames) {
    const auto structure = Make("T", {{"a", MetaInt::New(1)}});
    structure->LockStructure();
    structure->SetField("a", "another kind");
    EXPECT_EQ(Thrown([&] { structure->SetField("b", 1); }),
              "Unable to set new field b on structure. Structure has been locked");
    EXPECT_EQ(Thrown([&] { structure->RemoveField("nosuch"); }),
              "Structure is locked, unable to remove fields");
    EXPECT_EQ(Thrown([&] { structure->SetField("b", std::shared_ptr<MetaInt>()); }),
              "Invalid NULL value was assigned to the field b in the structure T");
    EXPECT_EQ(structure->ToString(), "{'a' => 'another kind', }");
}

TEST(Struct, ADefinitionFreezesItselfAndBoundsItsInstances) {
    const auto definition = Make("T", {{"a", MetaInt::New()}, {"b", MetaString::New()}});
    const auto instance = MetaStruct::New(definition);
    EXPECT_EQ(Thrown([&] { definition->SetField("c", 1); }),
              "Unable to set new field c on structure. Structure has been locked");
    EXPECT_EQ(Thrown([&] { instance->SetField("c", 1); }),
              "Unable to set new field c on structure.  The field does not match the Structure"
              " definition for this MetaStruct.");
    instance->SetField("a", "no Int");
    EXPECT_FALSE(instance->MatchesStructureDefinition());
    instance->SetField("b", "");
    EXPECT_FALSE(instance->MatchesStructureDefinition());
    instance->SetField("a", 1);
    EXPECT_TRUE(instance->MatchesStructureDefinition());
    EXPECT_EQ(instance->GetStructureDefinition(), definition);
    instance->RemoveField("a");
    EXPECT_TRUE(definition->MatchesStructureDefinition());
}

TEST(Struct, ComparesFieldByField) {
    const auto one = MetaInt::New(1);
    const auto text = MetaString::New("x");
    const auto ab = Make("T", {{"a", one}, {"b", one}});
    const struct {
        std::shared_ptr<MetaObject> other;
        const char* outcome;
    } cases[] = {
        {Make("T", {{"a", MetaInt::New(2)}, {"b", one}}), "same"},
        {Make("U", {{"a", one}, {"b", one}}), "same\nType names do not match."},
        {nullptr, "differs\nInvalid NULL input to MetaStruct validation."},
        {MetaList::New(MetaType::Int),
         "differs\nType Mismatch in MetaStruct Validation: Expected type Struct got type List"},
        {Make("T", {{"a", one}, {"c", one}}), "differs\nMissing field in input: b"},
        {Make("T", {{"a", one}, {"b", one}, {"c", one}}),
         "differs\nMismatch on number of fields set in struct. Expected 2 found 3"},
        {Make("U", {{"b", text}}),
         "differs\nType names do not match.\n"
         "Mismatch on number of fields set in struct. Expected 2 found 1\n"
         "Missing field in input: a"},
        {Make("T", {{"a", text}, {"b", text}}), "differs\nType mismatch on field: a"},
    };
    for (const auto& [other, outcome] : cases) {
        EXPECT_EQ(Compare(*ab, other), outcome);
    }
    EXPECT_EQ(Compare(*Make("T", {{"s", ab}}), Make("T", {{"s", Make("T", {{"a", one}})}})),
              "differs\nMismatch on number of fields set in struct. Expected 2 found 1\n"
              "Missing field in input: b\nType mismatch on field: s");
}

TEST(List, ComparesDeclarationsAndNoItems) {
    const auto ints = MetaList::New(MetaType::Int);
    const auto filled = MetaList::New(MetaType::Int);
    filled->AddAll(std::vector<long>{1, 2});
    const auto rows = MetaList::New(MetaType::Struct, Make("T", {{"a", MetaInt::New()}}));
    const auto shapeless = MetaList::New(MetaType::Struct, Struct());
    EXPECT_EQ(Compare(*ints, filled), "same");
    EXPECT_EQ(Compare(*ints, nullptr), "differs\nMismatch on structure, NULL comparison");
    EXPECT_EQ(Compare(*ints, MetaInt::New()),
              "differs\nType mismatch!  Was expecting a List, but got a Int");
    EXPECT_EQ(Compare(*ints, MetaList::New(MetaType::String)), "differs\nMismatch on list type");
    EXPECT_EQ(Compare(*ints, rows), "differs\nMismatch on list type");
    EXPECT_EQ(Compare(*rows, shapeless), "same");
    EXPECT_EQ(Compare(*shapeless, rows), "same");
    EXPECT_EQ(Compare(*rows, MetaList::New(MetaType::Struct, MetaStruct::New("T"))),
              "differs\nMismatch on number of fields set in struct. Expected 1 found 0\n"
              "Missing field in input: a\nList type mismatch list and input");
}

TEST(List, TakesOnlyWhatItDeclares) {
    const auto shape = Make("T", {{"a", MetaInt::New()}, {"b", MetaInt::New()}});
    const auto rows = MetaList::New(MetaType::Struct, shape);
    const auto refusal = [&rows](const Struct& item) { return Thrown([&] { rows->Add(item); }); };
    rows->Add(Make("Other", {{"a", MetaInt::New(1)}, {"b", MetaInt::New(2)}}));
    EXPECT_EQ(
        refusal(Make("T", {{"a", MetaInt::New(1)}})),
        "Invalid structure detected by MetaList::Add.  Type Errors were: (3) : Mismatch on"
        " number of fields set in struct. Expected 2 found 1, Missing field in input: b, There"
        " was an error adding an item to this list.  The item being added did not match the"
        " declared structure of this list, so it was not added.");
    EXPECT_EQ(refusal(nullptr), "Null object passed to Add");
    EXPECT_EQ(
        Thrown([] { MetaList::New(MetaType::Bool)->Add(1); }),
        "Invalid type specificed in MetaList.  Expected object of type Bool got object of type"
        " Int");
    EXPECT_EQ(Thrown([&] { MetaList::New(MetaType::Struct, MetaInt::New(1))->Add(shape); }),
              "Invalid structure detected by MetaList::Add.  Type Errors were: (1) : List created"
              " with NULL structure.  No items can be added to this list.");
    EXPECT_EQ(Thrown([&] { shape->SetField("c", 1); }),
              "Unable to set new field c on structure. Structure has been locked");
    EXPECT_EQ(rows->ToString(), "{'a' => '1', 'b' => '2', }");
}

TEST(List, ValidatesWithoutAdding) {
    const auto list = MetaList::New(MetaType::Int);
    std::vector<std::string> errors;
    EXPECT_TRUE(list->Validate(MetaInt::New(1), &errors));
    EXPECT_FALSE(list->Validate(nullptr, &errors));
    EXPECT_FALSE(list->Validate(MetaBool::New(), &errors));
    EXPECT_FALSE(list->Validate(nullptr, nullptr));
    EXPECT_EQ(errors, Names({"Invalid NULL input",
                             "There was an error adding an item to this list.  The item being added"
                             " was not the correct type for this list, so it was not added."}));
    EXPECT_EQ(list->GetCount(), 0U);
}

TEST(List, IsOfScalarsOrOfStructs) {
    const auto shape = MetaStruct::New("T");
    for (const MetaType type : {MetaType::Struct, MetaType::List}) {
        EXPECT_EQ(Thrown([type] { (void)MetaList::New(type); }),
                  "Integer, boolean or string type expected for list.");
    }
    for (const MetaType type : {MetaType::Int, MetaType::String, MetaType::List}) {
        EXPECT_EQ(Thrown([&] { (void)MetaList::New(type, shape); }),
                  "Struct type expected for list.");
    }
}

TEST(List, ItemsAreReadAndDeletedByIndex) {
    const auto list = MetaList::New(MetaType::String);
    EXPECT_EQ(list->ToString(), "");
    list->AddAll(Names({"a", "b", "c", "d", "e"}));
    list->Delete(4);
    list->Delete(0);
    list->Delete(1);
    EXPECT_EQ(list->ToString(), "b, d");
    EXPECT_EQ(list->GetItem(1)->ToString(), "d");
    EXPECT_EQ(Thrown([&] { (void)list->GetItem(2); }),
              "Get requested on invalid index of MetaList");
    EXPECT_EQ(Thrown([&] { list->Delete(2); }), "Delete requested on invalid index of MetaList");
}

}  // namespace
}  // namespace MetaObj
