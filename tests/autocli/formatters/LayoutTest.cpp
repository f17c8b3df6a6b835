// Text laid out for people: wrapping, tables and the two help pages.

#include <tests/support/TestCommand.h>
#include <tests/support/Thrown.h>
#include <zelmar/autocli/CommandInput.h>
#include <zelmar/autocli/formatters/CliDispatcherHelpFormatter.h>
#include <zelmar/autocli/formatters/CommandHelpFormatter.h>
#include <zelmar/autocli/formatters/FitString.h>
#include <zelmar/autocli/formatters/TableFormatter.h>
#include <zelmar/metaobj/MetaList.h>

#include <gtest/gtest.h>

#include <sstream>

using CallSpec::Output;
using CallSpec::ParameterSpec;
using MetaObj::MetaInt;
using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace AutoCli {
namespace {

using Parameters = std::vector<std::pair<const char*, const char*>>;

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

TEST(Table, LaysOutItsColumns) {
    const auto rows = Rows({Row("a", 10, "hello world"), Row("bb", 2000, "x")});
    const struct {
        Parameters parameters;
        uint16_t width;
        const char* table;
    } cases[] = {
        {{{"fields", "Name,Size,Note"}, {"wrap-last", "true"}},
         0,
         "Name  Size  Note\n"
         "----  ----  ----\n"
         "a       10  hello world\n"
         "bb    2000  x\n"},
        {{{"fields", "Name,Size,Note"}, {"wrap-last", "true"}},
         20,
         "Name  Size  Note\n"
         "----  ----  ----\n"
         "a       10  hello \n"
         "            world\n"
         "bb    2000  x\n"},
        {{{"fields", "Name,Size,Note"}, {"wrap-last", "true"}, {"units:Row.Note", "!"}},
         15,
         "Name  Size  Note\n"
         "----  ----  ----\n"
         "a       10  hello world !\n"
         "bb    2000  x !\n"},
        {{{"fields", "Name,Note"}, {"wrap-last", "true"}, {"units:Row.Note", "!"}},
         16,
         "Name  Note\n"
         "----  ----\n"
         "a     hello \n"
         "      world\n"
         "bb    x\n"},
        {{{"units:Row.Size", "Mb"}, {"printf:Row.Size", "%05ld"}},
         9,
         "Name  Note         Size\n"
         "----  -----------  ----\n"
         "a     hello world  00010 Mb  \n"
         "bb    x            02000 Mb  \n"},
        {{{"fields:Row", " \tName ,Name\r"}, {"fields", "Note"}},
         0,
         "NameName\n"
         "----\n"
         "aa\n"
         "bbbb\n"},
        {{{"fields:row", "Size"}, {"table-columns", "Size"}, {"header-line", "false"}},
         0,
         "Size\n"
         "  10  \n"
         "2000  \n"},
        {{{"fields", "Note,Size,Note"}, {"show-header", ""}, {"table-header", "false"}},
         0,
         "hello world  10  hello world\n"
         "x2000  x\n"},
        {{{"fields", "Name"}, {"show-header", "true"}, {"table-header", "false"}},
         0,
         "Name\n----\na\nbb\n"},
        {{{"fields", ""}}, 0, "\n\n"},
    };
    for (const auto& [parameters, width, table] : cases) {
        EXPECT_EQ(Print<TableFormatter>(rows, parameters, width), table);
    }
    EXPECT_EQ(Print<TableFormatter>(Rows({}), {{"fields", "Size,Name"}}),
              "Size  Name\n----  ----\n");
}

TEST(Table, WrapsEachLineOfItsLastCell) {
    EXPECT_EQ(Print<TableFormatter>(Rows({Row("a", 1, "one two\n\nthree\n"), Row("b", 2, "")}),
                                    {{"fields", "Name,Note"}, {"wrap-last", "true"}}, 12),
              "Name  Note\n----  ----\na     one \n      two\n      \n      three\nb     \n");
}

TEST(Table, ReachesIntoNestedValues) {
    const auto disk = MetaStruct::New("Disk");
    disk->SetField("Size", 7);
    disk->SetField("Tags", std::vector<std::string>{"a", "b"});
    const auto row = MetaStruct::New("Row");
    row->SetField("Disk", disk);
    const auto rows = MetaList::New(MetaType::Struct, row);
    rows->Add(row);
    EXPECT_EQ(Print<TableFormatter>(
                  rows, {{"fields", "Disk.Size,Disk.Tags,Disk"}, {"units:Row.Disk.Size", "Mb"}}),
              "Disk.Size  Disk.Tags  Disk\n"
              "---------  ---------  ----\n"
              "     7 Mb  a, b       {'Size' => '7', 'Tags' => 'a, b', }\n");
}

TEST(Table, ComplainsBeforeItWritesAnything) {
    EXPECT_EQ(
        Print<TableFormatter>(Rows({Row("a", 1, "x")}), {{"fields", "Name,Nosuch"}}, 0, false),
        "Error: Unknown field in field list: Nosuch\n");
    const auto shapeless = MetaList::New(MetaType::Struct, std::shared_ptr<MetaStruct>());
    EXPECT_EQ(Print<TableFormatter>(shapeless), "");
    const std::shared_ptr<MetaObject> others[] = {nullptr, MetaInt::New(1), Row("a", 1, "x"),
                                                  MetaList::New(MetaType::Int)};
    for (const auto& root : others) {
        EXPECT_EQ(
            Thrown([&] { (void)Print<TableFormatter>(root); }),
            "Error: Unexpected type for output, formatter, table, expected a List of structs");
    }
}

std::shared_ptr<ParameterSpec> Parameter(const char* name, const char* description, bool required,
                                         bool secret) {
    auto parameter = ParameterSpec::New(name, CallSpec::ParameterTypeString);
    parameter->SetDescription(description);
    parameter->SetRequired(required);
    if (secret) {
        parameter->SetSecret(true);
    }
    return parameter;
}

std::shared_ptr<TestCommand> HelpfulCommand() {
    const auto speed = Parameter("speed", "How fast: %FULLENUM%", false, false);
    const auto speeds = CallSpec::ParameterConstraint::New(CallSpec::ConstraintTypeStringEnum);
    speeds->AddStringEnum("fast", "in a hurry");
    speeds->AddStringEnum("slow", "in no hurry");
    speed->SetConstraint(speeds);
    speed->SetShortName("s");
    auto command = TestCommand::New(TestCommand::Answer,
                                    {Parameter("name", "The name that it will have.", true, false),
                                     Parameter("silent", "", false, false), speed,
                                     Parameter("word", "Pass word.", true, true)});
    command->SetDescription("Does it, and says so at a length that is not wrapped.");
    return command;
}

std::string HelpPage(TestCommand& command, const std::shared_ptr<CallSpec::Input>& input,
                     uint16_t width) {
    const auto output = Output::New();
    command.GenerateHelpOutput(input, output);
    return Print<CommandHelpFormatter>(output->GetRootObject(), {}, width);
}

std::shared_ptr<CommandInput> CallOfKelvash() {
    auto input = CommandInput::New();
    input->SetDispatcher("kelvash");
    std::list<std::string> path = {"a", "b"};
    input->SetCommandPath(path);
    return input;
}

TEST(CommandHelp, WrapsDescriptionsInTheirColumn) {
    const auto command = HelpfulCommand();
    command->AddExample("--name x", "Sets the name to something short");
    command->AddExample("", "Second");
    EXPECT_EQ(HelpPage(*command, CallOfKelvash(), 36),
              "Usage: kelvash a b <options>\n"
              "\n"
              "Description: Does it, and says so at a length that is not wrapped.\n"
              "\n"
              "  -h|--help     Show the help \n"
              "                message.\n"
              "     --name     The name that it \n"
              "                will have. \n"
              "                (required)\n"
              "     --silent   \n"
              "  -s|--speed    How fast: \n"
              "                    fast: in a hurry\n"
              "                    slow: in no \n"
              "                hurry\n"
              "     --word     Pass word. \n"
              "                (required secret)\n"
              "                WARNING: Providing \n"
              "                secret values on \n"
              "                the command line is \n"
              "                insecure because it \n"
              "                may be logged or \n"
              "                preserved in \n"
              "                history files. \n"
              "                Instead, specify \n"
              "                this option with no \n"
              "                value on the \n"
              "                command line, and \n"
              "                enter the value on \n"
              "                the supplied \n"
              "                prompt.\n"
              "\n"
              "Examples: \n"
              "\n"
              "    Sets the name to something \n"
              "    short :\n"
              "# kelvash a b --name x        \n"
              "\n"
              "    Second :\n"
              "# kelvash a b         \n"
              "\n");
}

TEST(CommandHelp, AskedForWithoutALineNamesNoCommand) {
    EXPECT_EQ(HelpPage(*TestCommand::New(), CallSpec::Input::New(), 0),
              "Usage:   <options>\n\nDescription: \n\n  -h|--help   Show the help message.\n");
}

TEST(CommandHelp, IsAValueWithTypedLists) {
    const auto output = Output::New();
    TestCommand::New()->GenerateHelpOutput(CallOfKelvash(), output);
    EXPECT_EQ(
        output->GetRootObject()->ToString(),
        "{'Description' => '', 'Dispatcher' => 'kelvash', 'Example List' => '', 'Param List' =>"
        " '{'Description' => 'Show the help message.', 'Name' => 'help', 'Required' => 'false',"
        " 'Secret' => 'false', 'Short Name' => 'h', }', 'Path' => 'a b', }");
    for (const auto& root : {std::shared_ptr<MetaObject>(),
                             std::shared_ptr<MetaObject>(MetaStruct::New("KelVashCommand"))}) {
        EXPECT_EQ(Thrown([&root] { (void)Print<CommandHelpFormatter>(root); }),
                  "Error: Unexpected type for output, formatter expected a struct with help"
                  " information");
    }
}

std::shared_ptr<MetaStruct> Page(const std::vector<std::vector<const char*>>& nodes) {
    const auto shape = MetaStruct::New("NamespaceNode");
    for (const char* name : {"Name", "Description", "Type"}) {
        shape->SetField(name, "");
    }
    const auto list = MetaList::New(MetaType::Struct, shape);
    for (const auto& node : nodes) {
        const auto entry = MetaStruct::New(shape);
        entry->SetField("Name", node[0]);
        entry->SetField("Description", node[1]);
        entry->SetField("Type", node[2]);
        list->Add(entry);
    }
    auto page = MetaStruct::New("KelvashCommandPrint");
    page->SetField("Dispatcher", "t");
    page->SetField("Path", std::vector<std::string>{"a", "b"});
    page->SetField("NamespaceNodes", list);
    return page;
}

TEST(Listing, ShowsNamespacesAndThenCommands) {
    EXPECT_EQ(Print<CliDispatcherHelpFormatter>(Page({{"run", "Runs it until it stops.", "Command"},
                                                      {"disk", "", "Namespace"},
                                                      {"network", "All nets.", "Namespace"},
                                                      {"odd", "Neither.", "Unknown"}}),
                                                {}, 18),
              "Usage: t [disp options] a b <namespaces> <command>\n"
              "\n"
              "For help please run t --help\n"
              "\n"
              "Available Namespaces: \n"
              "\n"
              "disk     \n"
              "network  All nets.\n"
              "\n"
              "Available Commands: \n"
              "\n"
              "run   Runs it \n"
              "      until it \n"
              "      stops.\n"
              "\n");
}

TEST(Listing, HasPlaceholdersForWhatIsMissing) {
    const auto page = Page({});
    page->SetField("Dispatcher", 1);
    page->SetField("Path", std::vector<std::string>());
    page->SetField("NamespaceNodes", "no list");
    EXPECT_EQ(Print<CliDispatcherHelpFormatter>(page),
              "Usage: <Dispatcher> [disp options] <namespaces> <command>\n\n"
              "For help please run <Dispatcher> --help\n\n"
              "Available Namespaces: \n\nERROR, list is bad\n"
              "Available Commands: \n\nERROR, list is bad\n");
    EXPECT_EQ(Thrown([] { (void)Print<CliDispatcherHelpFormatter>(Row("a", 1, "x")); }),
              "Error: Unexpected type for help output, formatter expected a struct with help data");
}

}  // namespace
}  // namespace AutoCli
