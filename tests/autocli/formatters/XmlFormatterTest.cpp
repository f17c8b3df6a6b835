#include <zelmar/autocli/formatters/XmlFormatter.h>

#include <gtest/gtest.h>

#include <sstream>

#include "Values.h"

using MetaObj::MetaList;
using MetaObj::MetaType;

namespace AutoCli {

TEST(XmlFormatter, DocumentNamesStylesheetAndParameters) {
    auto item = MetaObj::MetaStruct::New("Item");
    item->SetField("id", 7);
    item->SetField("tags", std::vector<std::string>{"a", "b<c"});
    auto output = CallSpec::Output::New();
    output->SetRootObject(item);
    FormatParameters parameters;
    parameters.SetParameter("stylesheet", "s.xsl?a&b");
    parameters.SetParameter("printf:Item.id", "<%3d>");
    DisplayContext context;
    std::ostringstream text;

    EXPECT_TRUE(XmlFormatter().Format(output, parameters, context, text));
    EXPECT_EQ(text.str(), R"(<?xml version="1.0"?>
<?xml-stylesheet type="text/xsl" href="s.xsl?a&b"?>
<output xmlns:kelvash="http://norvane.example/Products/TRELL/5.0/kelvash">
   <meta-data>
      <meta-data-field name="printf:Item.id" value="&lt;&#37;3d&gt;"/>
      <meta-data-field name="stylesheet" value="s.xsl?a&amp;b"/>
   </meta-data>
   <root>
      <structure typeName="Item">
         <field name="id">
            <integer>7</integer>
         </field>
         <field name="tags">
            <list type="string">
                  <string>a</string>
                  <string>b&lt;c</string>
            </list>
         </field>
      </structure>
   </root>
</output>
)");
}

// The factories refuse lists of lists and of no known kind; the constructor does not.
TEST(XmlFormatter, ListsOfEveryKind) {
    const auto listOf = [](MetaType type) {
        return std::make_shared<MetaList>(type, nullptr, MetaObj::MetaObject::FactoryFlag());
    };
    const auto lists = listOf(MetaType::List);
    for (const MetaType type : {MetaType::Bool, MetaType::Int, MetaType::String, MetaType::List,
                                MetaType::Struct, MetaType(7)}) {
        lists->Add(listOf(type));
    }
    std::ostringstream text;
    XmlFormatter().Format(lists, text, 0);
    EXPECT_EQ(text.str(),
              "<list type=\"list\">\n"
              "      <list type=\"boolean\">\n      </list>\n"
              "      <list type=\"integer\">\n      </list>\n"
              "      <list type=\"string\">\n      </list>\n"
              "      <list type=\"list\">\n      </list>\n"
              "      <list type=\"structure\">\n      </list>\n"
              "      <list type=\"\">\n      </list>\n"
              "</list>\n");
}

TEST(XmlFormatter, SantizeStringReplacesSixCharacters) {
    EXPECT_EQ(SantizeString("<a b='c' d=\"e\">100% & &lt;</a>\x01\xC3\n"),
              "&lt;a b=&apos;c&apos; d=&quot;e&quot;&gt;100&#37; &amp; &amp;lt;&lt;/a&gt;"
              "\x01\xC3\n");
    EXPECT_EQ(SantizeString(std::string("\0&", 2)), std::string("\0&amp;", 6));
    EXPECT_EQ(SantizeString(""), "");
}

}  // namespace AutoCli
