// Text laid out for people: wrapping, tables and the two help pages.

#include <tests/support/Golden.h>
#include <tests/support/TestCommand.h>
#include <tests/support/Thrown.h>
#include <zelmar/autocli/formatters/CliDispatcherHelpFormatter.h>
#include <zelmar/autocli/formatters/CommandHelpFormatter.h>
#include <zelmar/autocli/formatters/FitString.h>
#include <zelmar/autocli/formatters/TableFormatter.h>
#include <zelmar/metaobj/MetaList.h>

#include <gtest/gtest.h>

#include <climits>
#include <sstream>

using CallSpec::Output;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace AutoCli {
namespace {

using Parameters = std::vector<std::pair<std::string, std::string>>;

template <class Printer>
std::string Print(const std::shared_ptr<MetaObject>& root, const Parameters& values = {},
                  uint16_t width = 0, bool answer = true) {
    const auto output = Output::New();
    output->SetRootObject(root);
    FormatParameters parameters;
    for (const auto& [key, value] : values) {
        parameters.SetParameter(key, value);
    }
    DisplayContext context;
    context.screenWidth = width;
    std::ostringstream stream;
    EXPECT_EQ(Printer().Format(output, parameters, context, stream), answer);
    return stream.str();
}

TEST(FitString, WrapsAtBlanksWithinItsColumns) {
    const struct {
        int indent, width;
        const char* text;
        bool skipFirst, endLine;
        char breakChar;
        bool split;
        const char* result;
    } cases[] = {
        {2, 9, "1234567", false, false, 0, false, "  1234567"},
        {INT_MAX, 9, "unindented", true, false, 0, true, "unindented"},
        {2, 9, "123 567", false, true, 0, false, "  123 567\n"},
        {2, 9, "12 45 78", false, true, 0, false, "  12 45 \n  78\n"},
        {2, 9, "12 456 8", true, false, '\\', false, "12 456\\\n  8"},
        {2, 9, "123456789 1", true, false, '/', false, "/\n  123456789/\n  1"},
        {2, 9, "a  b   cd ", true, false, '/', false, "a  b  /\n  cd"},
        {2, 9, "         ", true, false, '/', false, "      /\n   "},
        {0, 5, "abc", false, false, 0, false, " abc"},
        {-3, 1, "ab cd", false, false, 0, false, " ab \n cd"},
        {4, 4, "ab cd", false, true, 0, false, "    ab cd\n"},
        {4, 3, "ab cd", true, false, 0, false, "ab cd"},
        {4, 0, "a\nb", false, true, 0, true, "    a\n    b\n"},
        {4, 9, "", false, true, 0, true, ""},
        {4, 9, "", false, true, 0, false, "    \n"},
        {4, 9, "\n", true, true, 0, true, "\n"},
        {2, 9, "ab\n\n12 45 78\n", true, false, '/', true, "ab\n  \n  12 45/\n  78"},
        {2, 9, "ab\ncd", false, true, 0, true, "  ab\n  cd\n"},
    };
    for (const auto& c : cases) {
        std::ostringstream stream;
        AutoCli_FitString(c.indent, c.width, c.text, c.skipFirst, stream, c.endLine, c.breakChar,
                          c.split);
        EXPECT_EQ(stream.str(), c.result) << c.text;
    }
}

std::shared_ptr<MetaStruct> Row(const char* name, long size, const char* note) {
    auto row = MetaStruct::New("Row");
    row->SetField("Name", name);
    row->SetField("Note", note);
    row->SetField("Size", size);
    return row;
}

std::shared_ptr<MetaList> Rows(const std::vector<std::shared_ptr<MetaStruct>>& items) {
    auto list = MetaList::New(MetaType::Struct, Row("", 0, ""));
    for (const auto& item : items) {
        list->Add(item);
    }
    return list;
}

TEST(Table, ComplainsBeforeItWritesAnything) {
    EXPECT_EQ(
        Print<TableFormatter>(Rows({Row("a", 1, "x")}), {{"fields", "Name,Nosuch"}}, 0, false),
        "Error: Unknown field in field list: Nosuch\n");
    const auto shapeless = MetaList::New(MetaType::Struct, std::shared_ptr<MetaStruct>());
    EXPECT_EQ(Print<TableFormatter>(shapeless), "");
}

// The help of a command without a description, whose parameter has none either, for no command
// line.
std::string BareHelpPage() {
    const auto parameter = CallSpec::ParameterSpec::New("silent", CallSpec::ParameterTypeString);
    parameter->SetRequired(false);
    const auto output = Output::New();
    TestCommand::New(TestCommand::Answer, {parameter})
        ->GenerateHelpOutput(CallSpec::Input::New(), output);
    return Print<CommandHelpFormatter>(output->GetRootObject());
}

// What stands in data/layout.txt, each page below a line "=== <what it shows>".
TEST(Layout, PagesAreTheGoldenOnes) {
    std::string pages;
    const auto rows = Rows({Row("a", 10, "hello world"), Row("bb", 2000, "x")});
    const struct {
        Parameters parameters;
        uint16_t width;
    } tables[] = {
        {{{"fields", "Name,Size,Note"}, {"wrap-last", "true"}}, 0},
        {{{"fields", "Name,Size,Note"}, {"wrap-last", "true"}, {"units:Row.Note", "!"}}, 15},
        {{{"fields", "Name,Note"}, {"wrap-last", "true"}, {"units:Row.Note", "!"}}, 16},
        {{{"fields", "Name,Note"}, {"wrap-last", "true"}}, 10},
        {{{"fields:Row", " \tName ,Name\r"}, {"fields:row", "Note"}}, 0},
        {{{"fields", "Note,Size,Note"}, {"show-header", ""}, {"table-header", "false"}}, 0},
        {{{"fields", "Name"}, {"show-header", "true"}, {"table-header", "false"}}, 0},
        {{{"fields", ""}}, 0},
    };
    for (const auto& [parameters, width] : tables) {
        pages +=
            "=== table " + testing::PrintToString(parameters) + " " + std::to_string(width) + "\n";
        pages += Print<TableFormatter>(rows, parameters, width);
    }
    pages += "=== table with lines in its last cell\n" +
             Print<TableFormatter>(Rows({Row("a", 1, "one two\n\nthree\n"), Row("b", 2, "")}),
                                   {{"fields", "Name,Note"}, {"wrap-last", "true"}}, 12);
    pages += "=== help without a line\n" + BareHelpPage();
    const auto page = MetaStruct::New("KelvashCommandPrint");
    page->SetField("Dispatcher", 1);
    page->SetField("Path", std::vector<std::string>());
    page->SetField("NamespaceNodes", "no list");
    pages += "=== listing of nothing\n" + Print<CliDispatcherHelpFormatter>(page);
    EXPECT_EQ(Thrown([] { (void)Print<CliDispatcherHelpFormatter>(Row("a", 1, "x")); }),
              "Error: Unexpected type for help output, formatter expected a struct with help data");
    ExpectGolden(TESTS_DIR "/autocli/formatters/data/layout.txt", pages);
}

}  // namespace
}  // namespace AutoCli
