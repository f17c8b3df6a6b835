// The dialect that extension commands print.

#include <tests/support/Schema.h>
#include <tests/support/Split.h>
#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/StreamInt.h>
#include <zelmar/autocli/extension/XmlOutput.h>
#include <zelmar/metaobj/MetaList.h>

#include <gtest/gtest.h>

#include <libxml/xmlmemory.h>

#include <cstdlib>
#include <cstring>
#include <ctime>
#include <locale>
#include <sstream>

using AutoCli::XmlUtil_ParseXmlOutput;

namespace {

const std::string unbuildable =
    "Error parsing command output.  Unable to build a proper metaobject from output tag.  output"
    " must contain properly formatted tags of type bool, int, string, structure and list. Error was"
    " : ";

// The value with its kind in front, "none", or what was thrown.
std::string Read(std::string_view text) {
    try {
        const auto value = XmlUtil_ParseXmlOutput(text);
        return value ? MetaTypeString(value->GetType()) + " " + value->ToString() : "none";
    } catch (const Zelmar::ZelmarException& error) {
        const std::string message = error.what();
        return message.starts_with(unbuildable) ? "! " + message.substr(unbuildable.size())
                                                : message;
    }
}

// libxml2 tells the details on the error stream, as it does for every host.
class XmlOutput : public testing::Test {
protected:
    void SetUp() override { testing::internal::CaptureStderr(); }
    void TearDown() override { _details = testing::internal::GetCapturedStderr(); }

    std::string _details;
};

TEST_F(XmlOutput, ReadsValues) {
    struct Case {
        const char* below;  // what stands below the root element
        const char* value;
    };
    const Case cases[] = {
        {"<int>7</int>", "Int 7"},
        {"<int>1</int><int>2</int>", "Int 1"},
        {"<int/>", "Int 0"},
        {"<int> \n-12abc</int>", "Int -12"},
        {"<int>9223372036854775807</int>", "Int 9223372036854775807"},
        {"<int>9223372036854775808</int>",
         "! Unable to read an int value from: '9223372036854775808'"},
        {"<int>x</int>", "! Unable to read an int value from: 'x'"},
        {"<int>5<!-- c --></int>", "! Unable to read an int value from: ' c '"},
        {"<bool>false</bool>", "Bool false"},
        {"<bool>f</bool>", "Bool false"},
        {"<bool>0</bool>", "Bool false"},
        {"<bool>F</bool>", "Bool true"},
        {"<bool/>", "Bool true"},
        {"<string/>", "String "},
        {"<string> a&lt;b </string>", "String  a<b "},
        {"<string>a<![CDATA[<b>]]></string>", "String <b>"},
        {"<string>a<b/>c</string>", "String c"},
        {"", "none"},
        {" <!-- only --> text <![CDATA[data]]>", "none"},
        {"<!-- first --><![CDATA[data]]><comment/><text/><int>1</int>", "Int 1"},
        {"<integer>1</integer>", "! Unable to make a MetaObject from a node with tag 'integer'"},
        {"<?pi x?>", "! Unable to make a MetaObject from a node with tag 'pi'"},
        {R"(<structure typeName="A"><other/></structure>)", "Struct {}"},
        {R"(<structure typeName="A"><field name="b"><int>2</int><int>3</int></field>
            <field name="a"><!-- x --><string>s</string></field><field name="c"/></structure>)",
         "Struct {'a' => 's', 'b' => '2', }"},
        {R"(<structure typeName="A"><field name="a"><int>1</int></field><field name="a"><int>2</int>
            </field></structure>)",
         "Struct {'a' => '2', }"},
        {"<structure/>", "! Invalid name specified for MetaStruct: "},
        {R"(<structure typeName="A"><field><int>2</int></field></structure>)",
         "! Invalid <field> tag found.  <field> requires a 'name' attribute."},
        {R"(<list type="string"/>)", "List "},
        {R"(<list type="int">text<int>1</int><!-- c --><int>2</int><![CDATA[x]]></list>)",
         "List 1, 2"},
        {R"(<list type="bool"><bool>f</bool><bool>t</bool></list>)", "List false, true"},
        {R"(<list type="structure"/>)", "List "},
        {R"(<list type="string"><int>1</int></list>)",
         "! Invalid type specificed in MetaList.  Expected object of type String got object of type"
         " Int"},
        {R"(<list type="structure"><int>1</int></list>)",
         "! Invalid type specificed in MetaList.  Expected object of type Struct got object of type"
         " Int"},
        {R"(<list type="structure"><structure typeName="A"/><structure typeName="A"><field name="a">
            <int/></field></structure></list>)",
         "! Invalid structure detected by MetaList::Add.  Type Errors were: (2) : Mismatch on"
         " number of fields set in struct. Expected 0 found 1, There was an error adding an item to"
         " this list.  The item being added did not match the declared structure of this list, so"
         " it was not added."},
        {R"(<list type="list"><list type="int"/></list>)", "! Struct type expected for list."},
        {R"(<list type="list"/>)", "! Struct type expected for list."},
        {"<list/>",
         "! Invalid list type attribute.  Must be one of [string, int, bool, structure, list]"},
    };
    // What the schema takes is read, but for what it cannot say.
    const Schema schema("output.xsd");
    std::string beyondSchema;
    for (const Case& test : cases) {
        const std::string text = "<output>" + std::string(test.below) + "</output>";
        EXPECT_EQ(Read(text), test.value) << test.below;
        if (std::string_view(test.value).starts_with("!") && schema.IsValid(text)) {
            beyondSchema += "\n" + std::string(test.below);
        }
    }
    EXPECT_EQ(beyondSchema, R"(
<int>5<!-- c --></int>
<list type="string"><int>1</int></list>
<list type="structure"><int>1</int></list>
<list type="structure"><structure typeName="A"/><structure typeName="A"><field name="a">
            <int/></field></structure></list>)");
}

TEST_F(XmlOutput, TakesWhatIsNoDocumentForNothing) {
    for (const char* text : {"", "   ", "<output>", "no xml", "<a/><b/>", "\xff\xfe<",
                             "<a>\x01</a>", "<o>&undeclared;</o>"}) {
        EXPECT_EQ(Read(text), "none") << text;
    }
    EXPECT_EQ(Read("<?xml version='1.0' encoding='ISO-8859-1'?><o><string>\xe9</string></o>"),
              "String \xc3\xa9");
    EXPECT_EQ(Read("<o><string>\xe9</string></o>"), "none");
}

// The shape of a list is made from its first item, once, and is not that item.
TEST_F(XmlOutput, GivesAListAShapeOfItsOwn) {
    const auto value = XmlUtil_ParseXmlOutput(
        R"(<o><list type="structure"><structure typeName="A"><field name="in"><structure typeName="B">
           <field name="x"><int>1</int></field></structure></field></structure></list></o>)");
    const auto* list = MetaObj::MetaCast<MetaObj::MetaList>(value.get());
    const auto item = std::dynamic_pointer_cast<MetaObj::MetaStruct>(list->GetItem(0));
    EXPECT_NE(list->GetListStructure(), item);
    EXPECT_NE(list->GetListStructure()->GetField("in"), item->GetField("in"));
    EXPECT_TRUE(list->GetListStructure()->IsSameStructure(item, nullptr));
    item->SetField("more", 1);  // the item is not locked
    EXPECT_FALSE(list->GetListStructure()->HasField("more"));
}

TEST_F(XmlOutput, BuildsEachOfFortyNestedListsOnce) {
    std::string text = "<string>core</string>";
    for (int level = 0; level < 40; ++level) {
        text = R"(<list type="structure"><structure typeName="A"><field name="a">)" + text +
               "</field></structure></list>";
    }
    EXPECT_TRUE(Read("<o>" + text + "</o>").starts_with("List {'a' => '{'a' => "));
}

TEST_F(XmlOutput, StopsAtNestingThatWouldExhaustTheStack) {
    std::string text;
    for (int level = 0; level < 10000; ++level) {
        text += R"(<list type="structure"><structure typeName="A"><field name="a">)";
    }
    EXPECT_EQ(Read("<o>" + text), "none");
}

TEST_F(XmlOutput, LoadsNothingFromOutside) {
    const std::string outside =
        "<!DOCTYPE o SYSTEM 'http://127.0.0.1:9/x.dtd' [<!ENTITY e SYSTEM 'file:///etc/passwd'>"
        "<!ENTITY % p SYSTEM 'file:///etc/passwd'> %p;]>";
    EXPECT_EQ(Read(outside + "<o><string>a&e;</string></o>"), "String a");
}

// References stay references: the text of one is what its declaration says, and names of entities
// that spell elements lead nowhere.
TEST_F(XmlOutput, ReadsEntitiesOfTheDocumentWithoutExpandingThem) {
    const std::string declared =
        "<!DOCTYPE o [<!ELEMENT x (a,b)><!ENTITY structure 'x'><!ENTITY e '&#60;b/>'><!ENTITY int "
        "'5'><!ATTLIST field name CDATA 'n'>]>";
    EXPECT_EQ(Read(declared + "<o><string>a&e;</string></o>"), "String <b/>");
    EXPECT_EQ(Read(declared + "<o>&int;</o>"), "Int 0");
    EXPECT_EQ(Read(declared + "<o>&structure;</o>"), "! Invalid name specified for MetaStruct: ");
    EXPECT_EQ(Read(declared +
                   R"(<o><structure typeName="A&int;B"><field><int/></field></structure></o>)"),
              "Struct {'n' => '0', }");
}

TEST_F(XmlOutput, DefusesEntityBombs) {
    std::string laughs = "<!DOCTYPE o [<!ENTITY a0 'ha'>";
    for (int level = 1; level < 12; ++level) {
        laughs += "<!ENTITY a" + std::to_string(level) + " '";
        for (int i = 0; i < 10; ++i) {
            laughs += "&a" + std::to_string(level - 1) + ";";
        }
        laughs += "'>";
    }
    std::string references;
    for (int i = 0; i < 100000; ++i) {
        references += "&e;";
    }
    const std::string large = "<!DOCTYPE o [<!ENTITY e '" + std::string(100000, 'a') + "'>]>";
    std::string items;
    std::string fields;
    for (int i = 0; i < 101; ++i) {
        items += "<string>&e;</string>";
        fields += "<field><int/></field>";
    }
    const std::string refused =
        "! The declarations of the document stand for more than 10000000 bytes";

    const std::clock_t begin = std::clock();
    EXPECT_EQ(Read(laughs + "]><o><string>&a11;</string></o>"), "none");
    EXPECT_EQ(Read(laughs + "]><o><structure typeName='&a11;'/></o>"), "none");
    EXPECT_EQ(Read(large + "<o><structure typeName='" + references + "'/></o>"), refused);
    EXPECT_EQ(Read("<!DOCTYPE o [<!ENTITY e '" + std::string(2000000, 'a') +
                   "'><!ENTITY f '&e;&e;'>]><o><structure typeName='&f;&f;&f;'/></o>"),
              refused);
    EXPECT_EQ(Read(large + "<o><list type='string'>" + items + "</list></o>"), refused);
    EXPECT_EQ(Read("<!DOCTYPE o [<!ATTLIST field name CDATA '" + std::string(100000, 'a') +
                   "'>]><o><structure typeName='A'>" + fields + "</structure></o>"),
              refused);
    EXPECT_LT(std::clock() - begin, 3 * CLOCKS_PER_SEC);
}

// Each allocation of libxml2 fails once. It may stop then, and take what it has for a document.
TEST_F(XmlOutput, IsWholeOrRefusedWhenMemoryRunsShort) {
    static int left = 0;
    static const auto allocate = +[](void* memory, size_t size) {
        return left-- != 0 ? std::realloc(memory, size) : nullptr;
    };
    const std::string whole = "String " + std::string(1000, 'c');
    for (int room = 0; left <= 0; ++room) {
        left = room;
        std::string read = "none";
        xmlMemSetup(
            std::free, [](size_t size) { return allocate(nullptr, size); }, allocate, strdup);
        try {
            read = Read("<o><string><![CDATA[" + whole.substr(7) + "]]></string></o>");
        } catch (const std::bad_alloc&) {
        }
        xmlMemSetup(std::free, std::malloc, std::realloc, strdup);
        EXPECT_TRUE(read == whole || read == "none" ||
                    read == "! There was not enough memory for the whole document")
            << room << ": " << read;
    }
}

TEST(StreamInt, ReadsAsAStreamDoes) {
    for (const auto& text :
         Split("| |0|+7|-7|+-7|-+7|--7|- 7|\t\v\f\r\n 12 3|12abc|0x10|007|+|-|abc|1,000|"
               "9223372036854775807|-9223372036854775808|9223372036854775808|"
               "-9223372036854775809|99999999999999999999x|.5|5.",
               '|')) {
        std::istringstream stream(text);
        stream.imbue(std::locale::classic());
        long number = 0;
        const bool good = static_cast<bool>(stream >> number);
        EXPECT_EQ(ReadStreamInt(text), good ? std::optional(number) : std::nullopt) << text;
    }
}

}  // namespace
