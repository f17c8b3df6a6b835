#include <tests/support/Split.h>
#include <zelmar/autocli/formatters/Formatter.h>
#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <gtest/gtest.h>

#include <climits>
#include <cstdio>
#include <cstring>

using MetaObj::MetaBool;
using MetaObj::MetaInt;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaString;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace AutoCli {
namespace {

using Value = std::shared_ptr<MetaObject>;

std::string Formatted(const Value& value, const std::string& format) {
    FormatParameters parameters;
    parameters.SetParameter("printf:T.F", format);
    return AutoCli_FormatField("T", "F", value, parameters);
}

// What the system's printf makes of the argument in the buffer that the format and value are given.
template <class Argument>
std::string Printed(const Value& value, const std::string& format, Argument argument) {
    std::string buffer(format.size() + value->ToString().size() + 65, '\0');
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat-nonliteral"
    (void)std::snprintf(buffer.data(), buffer.size(), format.c_str(), argument);
#pragma GCC diagnostic pop
    buffer.resize(std::strlen(buffer.c_str()));
    return buffer;
}

TEST(Field, HasUnitsAndAFormatByTypeAndName) {
    FormatParameters parameters;
    parameters.SetParameter("units:Disk.Size", "Mb");
    parameters.SetParameter("units:Disk.Free", "");
    parameters.SetParameter("printf:Disk.Size", "%08ld");
    const auto field = [&parameters](const char* type, const char* name, const Value& value) {
        return AutoCli_FormatField(type, name, value, parameters);
    };
    EXPECT_EQ(field("Disk", "Size", MetaInt::New(512)), "00000512 Mb");
    EXPECT_EQ(field("Disk", "Free", MetaInt::New(512)), "512 ");
    EXPECT_EQ(field("disk", "Size", MetaInt::New(512)), "512");
    EXPECT_EQ(field("Disk", "Size", nullptr), "NULL Object");
    EXPECT_EQ(field("Disk", "Size", MetaStruct::New("T")), " Mb");
    EXPECT_EQ(field("Disk", "Size", MetaList::New(MetaType::Int)), " Mb");
    EXPECT_EQ(field("Disk", "Size", MetaString::New("x")),
              "Error while handling formatting parameter printf:Disk.Size.  Unable to format field:"
              " Invalid argument");
}

TEST(Field, RefusesAFormatThatDoesNotFitTheValue) {
    const std::string refusal =
        "Error while handling formatting parameter printf:T.F.  Unable to format field: Invalid"
        " argument";
    for (const auto& format :
         Split("%n;%*d;%.*d;%s;%c;%p;%f;%d%d;%d "
               "%n;%;%l;%5;%5%;%1$d;%hhhd;%lhd;%-;%.;%m;%d%;%wd;%I64d;% %;%5.3",
               ';')) {
        EXPECT_EQ(Formatted(MetaInt::New(300), format), refusal) << format;
        EXPECT_EQ(Formatted(MetaBool::New(true), format), refusal) << format;
    }
    for (const char* format : {"%2147483648d", "%.99999999999d", "%99999999999n"}) {
        EXPECT_EQ(Formatted(MetaInt::New(300), format),
                  "Error while handling formatting parameter printf:T.F.  Unable to format field:"
                  " Value too large for defined data type");
    }
    for (const auto& format : Split("%d;%ls;%S;%n;%*s;%s%s;%.*s;%c;%hs;%5%", ';')) {
        EXPECT_EQ(Formatted(MetaString::New("abc"), format), refusal) << format;
    }
}

TEST(Field, PrintsTheWholeNumberWhateverLengthIsAskedFor) {
    for (const auto& format : Split("%d %hhd %hd %ld %lld %qd %jd %zd %td %Ld %i", ' ')) {
        EXPECT_EQ(Formatted(MetaInt::New(LONG_MIN), format), "-9223372036854775808") << format;
    }
    EXPECT_EQ(Formatted(MetaInt::New(-1), "<%hx>"), "<ffffffffffffffff>");
    EXPECT_EQ(Formatted(MetaBool::New(true), "%d") + Formatted(MetaBool::New(), "%i"), "10");
}

TEST(Field, TakesPlainTextAndAtMostOneConversion) {
    const Value text = MetaString::New("abc");
    EXPECT_EQ(Formatted(text, ""), "");
    EXPECT_EQ(Formatted(text, "%%d 100%%"), "%d 100%");
    EXPECT_EQ(Formatted(text, "%%%s%%%%"), "%abc%%");
    EXPECT_EQ(Formatted(MetaString::New(std::string("a\0b", 3)), "%s|"), "a|");
    EXPECT_EQ(Formatted(text, std::string("%s\0%n", 5)), "abc");
}

TEST(Field, FormatsAsTheSystemDoes) {
    const auto sizes =
        Split(";1;7;40;300;90000;0.;.0;.5;9.4;4.9;.300;400.300;300.400;90000.80000", ';');
    for (const auto& flags : Split(",-,0,+, ,#,-0,+ #,'", ',')) {
        for (const auto& size : sizes) {
            const std::string head = "a%" + flags + size;
            for (const char letter : std::string("diouxX")) {
                for (const long number : {0L, 7L, -7L, 123456789L, LONG_MIN}) {
                    const Value value = MetaInt::New(number);
                    const std::string format = head + "j" + letter + "%%z";
                    EXPECT_EQ(Formatted(value, format), Printed(value, format, number)) << format;
                }
            }
            for (const char* text : {"", "abc", "a text of some length"}) {
                const Value value = MetaString::New(text);
                EXPECT_EQ(Formatted(value, head + "s|"), Printed(value, head + "s|", text)) << head;
            }
        }
    }
}

TEST(Field, IsCutAtTheBufferHoweverWideItShouldBe) {
    const auto blanks = [](size_t count) { return std::string(count, ' '); };
    EXPECT_EQ(Formatted(MetaInt::New(42), "%2147483647d"), blanks(12 + 2 + 64));
    EXPECT_EQ(Formatted(MetaInt::New(42), "%-2147483647d|"), "42" + blanks(14 + 2 + 64 - 2));
    EXPECT_EQ(Formatted(MetaInt::New(-4), "%.2147483647d"),
              "-" + std::string(13 + 2 + 64 - 1, '0'));
    EXPECT_EQ(Formatted(MetaInt::New(42), "%2147483647.2147483646d"),
              " " + std::string(23 + 2 + 64 - 1, '0'));
    EXPECT_EQ(Formatted(MetaString::New("abc"), "%2147483647s"), blanks(12 + 3 + 64));
    EXPECT_EQ(Formatted(MetaString::New("abc"), "%.2147483647s|"), "abc|");
    EXPECT_EQ(Formatted(MetaBool::New(), "%70d"), blanks(69) + "0");
    EXPECT_EQ(Formatted(MetaBool::New(), "%74d"), blanks(73));
}

TEST(FormatParameters, SplitsAListAtCommasWithoutTrimming) {
    FormatParameters parameters;
    std::string lists;
    for (const char* value : {"", "a,b", "a, b", "a,,b", ",a", "a,", ",", ",,"}) {
        parameters.SetParameter("fields", value);
        lists += testing::PrintToString(parameters.GetParameterAsList("fields"));
    }
    EXPECT_EQ(lists,
              R"({}{ "a", "b" }{ "a", " b" }{ "a", "", "b" }{ "", "a" }{ "a" }{ "" }{ "", "" })");
    EXPECT_EQ(parameters.GetParameter("Fields"), "");
    EXPECT_TRUE(parameters.HasParameter("fields") && !parameters.HasParameter("Fields"));
}

TEST(FormatParameters, TheUsersChoiceIsLaidOverTheDefaults) {
    FormatParameters base;
    FormatParameters choice;
    base.SetFormatter("table");
    base.SetParameter("kept", "1");
    base.SetParameter("both", "2");
    choice.SetParameter("both", "");
    choice.SetParameter("new", "3");
    base.OverrideValues(choice);
    EXPECT_EQ(base.GetFormatter(), "table");
    choice.SetFormatter("json");
    base.OverrideValues(choice);
    EXPECT_EQ(base.GetFormatter(), "json");
    EXPECT_EQ(base.GetParameters(),
              (std::map<std::string, std::string>{{"both", ""}, {"kept", "1"}, {"new", "3"}}));
}

TEST(SubField, DotsLeadIntoNestedStructs) {
    const auto inner = MetaStruct::New("Inner");
    inner->SetField("b", "inner b");
    inner->SetField("", "nameless");
    const auto outer = MetaStruct::New("Outer");
    outer->SetField("a", inner);
    outer->SetField("b", "outer b");
    outer->SetField("list", std::vector<long>{1, 2});
    std::string found;
    for (const char* path : {"b", "nosuch", "a.b", "nosuch.b", "nosuch.a.b", "b.a", "a.nosuch",
                             "a.", "a..b", ".b", "list", "list.a", "a.nosuch.b", "", "."}) {
        const auto value = GetSubField(outer, path);
        found += std::string(path) + (value ? ": " + value->ToString() : ":") + "\n";
    }
    EXPECT_EQ(found,
              "b: outer b\nnosuch:\na.b: inner b\nnosuch.b: outer b\nnosuch.a.b: inner b\nb.a:\n"
              "a.nosuch:\na.: nameless\na..b:\n.b: outer b\nlist: 1, 2\nlist.a:\n"
              "a.nosuch.b: inner b\n:\n.:\n");
}

}  // namespace
}  // namespace AutoCli
