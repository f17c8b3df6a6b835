#include <zelmar/metaobj/MetaScalars.h>

#include <gtest/gtest.h>

#include <climits>
#include <sstream>

namespace MetaObj {
namespace {

using Errors = std::vector<std::string>;

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
}

TEST(Scalars, HaveTheStructureOfTheirKind) {
    Errors errors = {"kept"};
    EXPECT_TRUE(MetaInt::New(5)->IsSameStructure(MetaInt::New(7), &errors));
    EXPECT_FALSE(MetaInt::New(5)->IsSameStructure(MetaString::New("5"), &errors));
    EXPECT_FALSE(MetaBool::New()->IsSameStructure(nullptr, &errors));
    EXPECT_FALSE(MetaBool::New()->IsSameStructure(MetaInt::New(), nullptr));
    EXPECT_EQ(errors, Errors({"kept", "Type mismatch in structure.  Expecting Int got String",
                              "Type mismatch in structure.  Expecting Bool got "}));
}

TEST(Scalars, EveryKindHasAWord) {
    std::string words;
    for (int type = -1; type <= 5; ++type) {
        words += MetaTypeString(static_cast<MetaType>(type)) + ",";
    }
    EXPECT_EQ(words, ",Int,Bool,String,Struct,List,,");
}

TEST(Scalars, TextOfUnknownOriginIsEscapedOnlyWhereItIsInvalid) {
    EXPECT_EQ(MetaString::NewUtf8WithEscapes("\xc3\xa4\n\"")->GetValue(), "\xc3\xa4\n\"");
    EXPECT_EQ(MetaString::NewUtf8WithEscapes("\xc3\xa4\xff\n")->GetValue(), "\xc3\xa4\\xff\n");
}

}  // namespace
}  // namespace MetaObj
