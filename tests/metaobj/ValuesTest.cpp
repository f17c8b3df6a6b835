#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaScalars.h>
#include <zelmar/metaobj/MetaStruct.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <sstream>

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

TEST(Scalars, FrequentValuesAreShared) {
    EXPECT_EQ(MetaBool::New(), MetaBool::New(false));
    EXPECT_EQ(MetaBool::New(true), MetaBool::New(true));
    EXPECT_NE(MetaBool::New(true), MetaBool::New(false));
    EXPECT_EQ(MetaInt::New(), MetaInt::New(0));
    for (const long value : {-2L, -1L, 0L, 20L, 21L}) {
        EXPECT_EQ(MetaInt::New(value) == MetaInt::New(value), value >= -1 && value <= 20) << value;
    }
    EXPECT_EQ(MetaString::New(), MetaString::New(""));
    EXPECT_EQ(MetaString::New(), MetaString::New(std::string()));
    EXPECT_EQ(MetaString::New(), MetaString::NewUtf8WithEscapes(""));
    EXPECT_NE(MetaString::New("a"), MetaString::New("a"));
    EXPECT_TRUE(MetaBool::_sInitialized && MetaInt::_sInitialized && MetaString::_sInitialized);
}

TEST(Scalars, PrintAsPlainText) {
    const std::string bytes("\"\0\n\xff", 4);
    std::ostringstream text;
    text << *MetaBool::New(true) << *MetaBool::New() << *MetaInt::New(LONG_MIN)
         << *MetaInt::New(LONG_MAX) << *MetaString::New(bytes);
    EXPECT_EQ(text.str(), "truefalse-92233720368547758089223372036854775807" + bytes);
    EXPECT_EQ(MetaString::NewUtf8WithEscapes("\xc3\xa4\n\"")->GetValue(), "\xc3\xa4\n\"");
    EXPECT_EQ(MetaString::NewUtf8WithEscapes("\xc3\xa4\xff\n")->GetValue(), "\xc3\xa4\\xff\n");
}

TEST(Scalars, EveryKindHasAWord) {
    std::string words;
    for (int type = -1; type <= 5; ++type) {
        words += MetaTypeString(static_cast<MetaType>(type)) + ",";
    }
    EXPECT_EQ(words, ",Int,Bool,String,Struct,List,,");
}

TEST(Struct, TakesEveryKindOfValueUnderAnyName) {
    auto structure = MetaStruct::New("0aB");
    structure->SetField("", "text");
    structure->SetField("Short Name", std::string("moved"));
    structure->SetField("a.b", Names({"x", "y"}));
    structure->SetField("Z", std::vector<long>({1, -2}));
    structure->SetField("bits", std::vector<bool>({true, false}));
    structure->SetField("i", 3U);
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

TEST(Struct, FieldsAreSetAnewAndRemoved) {
    auto structure = MetaStruct::New("T");
    structure->SetField("a", MetaInt::New(1), "What a is.");
    EXPECT_EQ(structure->GetFieldDocumentation("a"), "What a is.");
    structure->SetField("a", 2);
    EXPECT_EQ(structure->GetFieldDocumentation("a"), "Documentation missing");
    EXPECT_EQ(structure->GetField("b"), nullptr);
    EXPECT_FALSE(structure->HasField("b"));
    structure->RemoveField("b");
    structure->RemoveField("a");
    EXPECT_EQ(structure->GetFieldNames(), Names());
}

TEST(Struct, ADefinitionBoundsItsInstances) {
    const auto definition = Make("T", {{"a", MetaInt::New()}, {"b", MetaString::New()}});
    const auto instance = MetaStruct::New(definition);
    instance->SetField("a", "no Int");
    EXPECT_FALSE(instance->MatchesStructureDefinition());
    instance->SetField("b", "");
    EXPECT_FALSE(instance->MatchesStructureDefinition());
    instance->SetField("a", 1);
    EXPECT_TRUE(instance->MatchesStructureDefinition());
    EXPECT_EQ(instance->GetStructureDefinition(), definition);
    instance->RemoveField("a");
    definition->SetField("a", "another kind");  // locked are the names alone
    EXPECT_TRUE(definition->MatchesStructureDefinition());
}

// A class of a host's own.
class Own final : public MetaObject {
public:
    Own(MetaType type, bool isLikeAll) : MetaObject(type, FactoryFlag()), _isLikeAll(isLikeAll) {}
    bool IsSameStructure(const std::shared_ptr<MetaObject>& other, Names* errors) const override {
        return _isLikeAll || MetaObject::IsSameStructure(other, errors);
    }
    [[nodiscard]] std::string ToString() const override { return ""; }

private:
    const bool _isLikeAll;
};

TEST(Values, AreComparedByTheirShape) {
    const auto one = MetaInt::New(1);
    const auto text = MetaString::New("x");
    const auto ab = Make("T", {{"a", one}, {"b", one}});
    const auto ints = MetaList::New(MetaType::Int);
    const auto filled = MetaList::New(MetaType::Int);
    filled->AddAll(std::vector<long>{1, 2});
    const auto rows = MetaList::New(MetaType::Struct, Make("T", {{"a", one}}));
    const auto beyond = std::make_shared<Own>(MetaType{9}, false);
    const auto likeAll = std::make_shared<Own>(MetaType{9}, true);
    const auto shapeless = MetaList::New(MetaType::Struct, Struct());
    const struct {
        std::shared_ptr<MetaObject> expected, other;
        const char* outcome;
    } cases[] = {
        {one, MetaInt::New(7), "same"},
        {one, text, "differs\nType mismatch in structure.  Expecting Int got String"},
        {MetaBool::New(), nullptr, "differs\nType mismatch in structure.  Expecting Bool got "},
        {ab, Make("T", {{"a", MetaInt::New(2)}, {"b", one}}), "same"},
        {ab, Make("U", {{"a", one}, {"b", one}}), "same\nType names do not match."},
        {ab, nullptr, "differs\nInvalid NULL input to MetaStruct validation."},
        {ab, ints,
         "differs\nType Mismatch in MetaStruct Validation: Expected type Struct got type List"},
        {ab, Make("T", {{"a", one}, {"c", one}}), "differs\nMissing field in input: b"},
        {ab, Make("T", {{"a", one}, {"b", one}, {"c", one}}),
         "differs\nMismatch on number of fields set in struct. Expected 2 found 3"},
        {ab, Make("U", {{"b", text}}),
         "differs\nType names do not match.\n"
         "Mismatch on number of fields set in struct. Expected 2 found 1\n"
         "Missing field in input: a"},
        {ab, Make("T", {{"a", text}, {"b", text}}), "differs\nType mismatch on field: a"},
        {Make("T", {{"o", beyond}}), Make("T", {{"o", beyond}}),
         "differs\nType mismatch in structure.  Expecting  got \nType mismatch on field: o"},
        {Make("T", {{"o", likeAll}}), Make("T", {{"o", beyond}}), "same"},
        {Make("T", {{"s", ab}}), Make("T", {{"s", Make("T", {{"a", one}})}}),
         "differs\nMismatch on number of fields set in struct. Expected 2 found 1\n"
         "Missing field in input: b\nType mismatch on field: s"},
        {ints, filled, "same"},
        {ints, nullptr, "differs\nMismatch on structure, NULL comparison"},
        {ints, one, "differs\nType mismatch!  Was expecting a List, but got a Int"},
        {ints, MetaList::New(MetaType::String), "differs\nMismatch on list type"},
        {ints, rows, "differs\nMismatch on list type"},
        {rows, shapeless, "same"},
        {shapeless, rows, "same"},
        {rows, MetaList::New(MetaType::Struct, MetaStruct::New("T")),
         "differs\nMismatch on number of fields set in struct. Expected 1 found 0\n"
         "Missing field in input: a\nList type mismatch list and input"},
    };
    for (const auto& [expected, other, outcome] : cases) {
        Names errors = {expected->IsSameStructure(other, nullptr) ? "same" : "differs"};
        EXPECT_EQ(expected->IsSameStructure(other, &errors), errors[0] == "same");
        std::string told = errors[0];
        std::for_each(errors.begin() + 1, errors.end(),
                      [&told](const auto& error) { told += "\n" + error; });
        EXPECT_EQ(told, outcome);
    }
}

TEST(List, TakesWhatFitsWhateverItsTypesName) {
    const auto rows = MetaList::New(MetaType::Struct, Make("T", {{"a", MetaInt::New()}}));
    rows->Add(Make("Other", {{"a", MetaInt::New(1)}}));
    EXPECT_EQ(rows->ToString(), "{'a' => '1', }");
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

TEST(List, ItemsAreReadAndDeletedByIndex) {
    const auto list = MetaList::New(MetaType::String);
    EXPECT_EQ(list->ToString(), "");
    list->AddAll(Names({"a", "b", "c", "d", "e"}));
    list->Delete(4);
    list->Delete(0);
    list->Delete(1);
    EXPECT_EQ(list->ToString(), "b, d");
    EXPECT_EQ(list->GetItem(1)->ToString(), "d");
}

// What called itself once a level would overflow the stack at this depth.
constexpr int levels = 100000;

// A struct in the declaration of a list, in a list, in a struct; and definitions of definitions.
TEST(DeepValues, DieLevelByLevel) {
    auto item = MetaStruct::New("Level");
    auto declared = MetaStruct::New("Level");
    auto defined = MetaStruct::New("Level");
    const std::vector<std::weak_ptr<MetaStruct>> innermost = {item, declared, defined};
    const auto anyList = MetaList::New(MetaType::Struct, Struct());
    item->SetField("in", anyList);
    for (int level = 0; level < levels; ++level) {
        auto list = MetaList::New(MetaType::Struct, Make("Level", {{"in", anyList}}));
        list->Add(item);
        item = Make("Level", {{"in", list}});
        declared = Make("Level", {{"in", MetaList::New(MetaType::Struct, declared)}});
        defined = MetaStruct::New(defined);
    }
    item.reset();
    declared.reset();
    defined.reset();
    EXPECT_TRUE(std::ranges::all_of(innermost, &std::weak_ptr<MetaStruct>::expired));
}

Struct NestedAround(std::shared_ptr<MetaObject> value) {
    for (int level = 0; level < levels; ++level) {
        value = Make("Level", {{"in", value}});
    }
    return std::static_pointer_cast<MetaStruct>(value);
}

TEST(DeepValues, ArePrintedAndComparedLevelByLevel) {
    const auto number = NestedAround(MetaInt::New(1));
    std::string text;
    std::string end;
    for (int level = 0; level < levels; ++level) {
        text += "{'in' => '";
        end += "', }";
    }
    EXPECT_TRUE(number->ToString() == text + "1" + end);
    EXPECT_TRUE(number->IsSameStructure(number, nullptr));

    Names complaints(levels, "Type mismatch on field: in");
    complaints.emplace_back("List type mismatch list and input");
    Names errors;
    const auto numbers = MetaList::New(MetaType::Struct, number);
    const auto truths = MetaList::New(MetaType::Struct, NestedAround(MetaBool::New()));
    EXPECT_FALSE(numbers->IsSameStructure(truths, &errors));
    EXPECT_EQ(errors, complaints);
}

}  // namespace
}  // namespace MetaObj
