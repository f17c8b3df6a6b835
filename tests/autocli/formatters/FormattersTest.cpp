// What holds for all formatters.

#include <plugins/formats/Delimited.h>
#include <plugins/formats/Html.h>
#include <plugins/formats/JsonLines.h>
#include <plugins/formats/Markdown.h>
#include <plugins/formats/Yaml.h>
#include <tests/support/Golden.h>
#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/InternalPlugin.h>
#include <zelmar/autocli/formatters/BlockOutput.h>
#include <zelmar/autocli/formatters/JsonFormatter.h>
#include <zelmar/autocli/formatters/PythonFormatter.h>
#include <zelmar/autocli/formatters/SimpleFormatter.h>
#include <zelmar/autocli/formatters/XmlFormatter.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <sstream>

#include "Values.h"

namespace AutoCli {

namespace {

// The formatters of any value.
std::vector<std::shared_ptr<Formatter>> Formatters() {
    return {std::make_shared<SimpleFormatter>(), std::make_shared<XmlFormatter>(),
            std::make_shared<PythonFormatter>(), std::make_shared<JsonFormatter>()};
}

// Those of the plugin with further formats.
std::vector<std::shared_ptr<Formatter>> FurtherFormatters() {
    return {std::make_shared<CsvFormatter>(),       std::make_shared<HtmlFormatter>(),
            std::make_shared<JsonLinesFormatter>(), std::make_shared<MarkdownFormatter>(),
            std::make_shared<TsvFormatter>(),       std::make_shared<YamlFormatter>()};
}

void Write(Formatter& formatter, const Value& value, std::ostream& stream) {
    auto output = CallSpec::Output::New();
    output->SetRootObject(value);
    FormatParameters parameters;
    DisplayContext context;
    formatter.Format(output, parameters, context, stream);
}

// What the value gives, or the exception in its place.
std::string TextOf(Formatter& formatter, const Value& value) {
    std::ostringstream text;
    try {
        Write(formatter, value, text);
    } catch (const Zelmar::ZelmarException& e) {
        text << "throws: " << e.what() << "\n";
    }
    return text.str();
}

// Of each document in XML or HTML, what stands between the lines that all have.
std::string WithoutFrame(const std::string& text, const std::string& frame, const char* end) {
    const size_t root = frame.find(end);
    const size_t start = std::min(root, frame.find("<tr>"));
    EXPECT_TRUE(text.starts_with(frame.substr(0, start)) && text.ends_with(frame.substr(root)));
    return text.substr(start, text.size() - start - (frame.size() - root));
}

}  // namespace

// data/<formatter>.txt holds the exact bytes, each value below a line "=== <its name>", and at the
// end which values are refused.
TEST(Formatters, SampleValuesGiveTheGoldenTexts) {
    const auto plugin = InternalPlugin::New();
    plugin->Initialize();
    auto formatters = plugin->GetFormatters();
    std::ranges::copy(FurtherFormatters(), std::back_inserter(formatters));
    const std::map<std::string, const char*> endsOfFrames = {{"xml", "   </root>"},
                                                             {"html", "</table>"}};
    for (const auto& formatter : formatters) {
        const auto framed = endsOfFrames.find(formatter->GetName());
        const std::string frame = TextOf(*formatter, nullptr);
        std::string texts;
        std::map<std::string, std::string> refused;
        for (const auto& [name, value] : SampleValues()) {
            const std::string text = TextOf(*formatter, value);
            if (text.starts_with("throws")) {
                refused[text] += name + ", ";
            } else {
                const bool cut = framed != endsOfFrames.end() && value;
                texts +=
                    "=== " + name + "\n" + (cut ? WithoutFrame(text, frame, framed->second) : text);
            }
        }
        for (const auto& [text, names] : refused) {
            texts += "=== " + text + names + "\n";
        }
        ExpectGolden(TESTS_DIR "/autocli/formatters/data/" + formatter->GetName() + ".txt", texts);
    }
}

// Flushing line by line lets a reader at the other end of a pipe follow, unless blocks are wanted.
TEST(Formatters, EveryLineEndIsAFlush) {
    struct Counter : std::stringbuf {
        int sync() override { return ++flushes, 0; }
        long flushes = 0;
    };
    for (const auto& formatter : Formatters()) {
        Counter counter;
        std::ostream stream(&counter);
        Write(*formatter, SampleValues()["struct"], stream);
        EXPECT_EQ(counter.flushes, std::ranges::count(counter.str(), '\n')) << formatter->GetName();

        counter.flushes = 0;
        {
            BlockOutput blocks(stream);
            Write(*formatter, SampleValues()["struct"], blocks);
        }
        EXPECT_EQ(counter.flushes, 1) << formatter->GetName();
    }
}

// A walk, a copy of a text or a destructor that calls itself once a level would overflow the stack.
TEST(Formatters, DepthIsBoundedByMemoryOnly) {
    struct Counter : std::streambuf {
        std::streamsize xsputn(const char*, std::streamsize count) override {
            return written += count, count;
        }
        int overflow(int c) override { return ++written, c; }
        std::streamsize written = 0;
    };
    constexpr long levels = 10000;
    const Value value = NestedStructs(levels);
    auto formatters = Formatters();
    std::ranges::copy(FurtherFormatters(), std::back_inserter(formatters));
    for (const auto& formatter : formatters) {
        Counter counter;
        std::ostream stream(&counter);
        Write(*formatter, value, stream);
        EXPECT_GT(counter.written, 6 * levels) << formatter->GetName();
    }
}

// What stands in front of the value where a stylesheet and parameters are given.
TEST(Formatters, ADocumentInXmlNamesStylesheetAndParameters) {
    auto output = CallSpec::Output::New();
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
   </root>
</output>
)");
}

TEST(PythonFormatter, KnowsAsciiByTheTopBit) {
    EXPECT_TRUE(PythonFormatter::IsAllAscii(""));
    EXPECT_TRUE(PythonFormatter::IsAllAscii(std::string("\0a\x7f", 3)));
    EXPECT_FALSE(PythonFormatter::IsAllAscii("a\x80"));
}

}  // namespace AutoCli
