#include <zelmar/autocli/formatters/XmlFormatter.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <gtest/gtest.h>

#include <sstream>

namespace AutoCli {

TEST(XmlFormatter, DocumentNamesStylesheetAndParameters) {
    auto output = CallSpec::Output::New();
    output->SetRootObject(MetaObj::MetaInt::New(7));
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
      <integer>7</integer>
   </root>
</output>
)");
}

}  // namespace AutoCli
