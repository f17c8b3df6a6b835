// What holds for all formatters.

#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/InternalPlugin.h>
#include <zelmar/autocli/formatters/JsonFormatter.h>
#include <zelmar/autocli/formatters/PythonFormatter.h>
#include <zelmar/autocli/formatters/SimpleFormatter.h>
#include <zelmar/autocli/formatters/XmlFormatter.h>
#include <zelmar/internal/BlockOutput.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <sstream>

#include "Values.h"

using MetaObj::MetaType;

namespace AutoCli {

namespace {

// The formatters of any value.
std::vector<std::shared_ptr<Formatter>> Formatters() {
    return {std::make_shared<SimpleFormatter>(), std::make_shared<XmlFormatter>(),
            std::make_shared<PythonFormatter>(), std::make_shared<JsonFormatter>()};
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

// The text between the elements that are the same in all documents.
std::string RootOf(const std::string& document) {
    const size_t start = document.find("   <root>\n");
    const size_t end = document.find("   </root>\n");
    return start == std::string::npos ? document : document.substr(start + 10, end - start - 10);
}

std::string Read(const std::string& path) {
    std::ostringstream text;
    text << std::ifstream(path, std::ios::binary).rdbuf();
    return text.str();
}

}  // namespace

// data/<formatter>.txt holds the exact bytes, each value below a line "=== <its name>". After a
// wanted change, run with ZELMAR_UPDATE_GOLDEN=1 and read the difference with care.
TEST(Formatters, SampleValuesGiveTheGoldenTexts) {
    const auto plugin = InternalPlugin::New();
    plugin->Initialize();
    for (const auto& formatter : plugin->GetFormatters()) {
        std::string texts;
        for (const auto& [name, value] : SampleValues()) {
            texts += "=== " + name + "\n" + TextOf(*formatter, value);
        }
        const std::string path = std::string(GOLDEN_DIR) + "/" + formatter->GetName() + ".txt";
        if (std::getenv("ZELMAR_UPDATE_GOLDEN") != nullptr) {
            std::ofstream(path, std::ios::binary) << texts;
        }
        EXPECT_EQ(texts, Read(path)) << path;
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
        Write(*formatter, SampleValues()[10].second, stream);
        EXPECT_EQ(counter.flushes, std::ranges::count(counter.str(), '\n')) << formatter->GetName();

        counter.flushes = 0;
        {
            const BlockOutput blocks(stream);
            Write(*formatter, SampleValues()[10].second, stream);
        }
        EXPECT_EQ(counter.flushes, 1) << formatter->GetName();
    }
}

TEST(Formatters, MisfitsAreTextAndTheRestGoesOn) {
    struct Row {
        MetaType kind;
        const char *simple, *xml, *python, *json;
    };
    const char* xmlOther = "Error Only simple int, bool, string and struct output supported";
    const Row rows[] = {
        {MetaType::Bool, "Error reading a bool", "<!-- Error reading a bool -->",
         "Error reading a bool", "Error reading a bool"},
        {MetaType::Int, "Error reading a int", "Error reading a int", "Error reading a int",
         "Error reading a int"},
        {MetaType::String, "Error reading a string", "Error reading a string",
         "Error reading a string", "Error reading a string"},
        {MetaType::Struct, "Error reading a struct from output.",
         "Error reading a struct from output.", "Error reading a struct from output.",
         "Error reading a struct from output."},
        {MetaType::List, "Error reading a List", "Error reading a List", "Error reading a List",
         "Error reading a List"},
        {MetaType(7), nullptr, xmlOther, "Unknown data type", "Unknown data type"},
    };
    const auto formatters = Formatters();
    for (const Row& row : rows) {
        const auto line = [](const char* text) {
            return text ? std::string(text) + "\n" : std::string();
        };
        const Value misfit = std::make_shared<Misfit>(row.kind);
        EXPECT_EQ(TextOf(*formatters[0], misfit), line(row.simple));
        EXPECT_EQ(RootOf(TextOf(*formatters[1], misfit)), line(row.xml));
        EXPECT_EQ(TextOf(*formatters[2], misfit), line(row.python) + "\n");
        EXPECT_EQ(TextOf(*formatters[3], misfit), line(row.json) + "\n");
    }

    auto record = MetaObj::MetaStruct::New("Record");
    record->SetField("a", std::make_shared<Misfit>(MetaType::Int));
    record->SetField("b", std::make_shared<Misfit>(MetaType::Struct));
    record->SetField("c", 1);
    EXPECT_EQ(TextOf(*formatters[0], record),
              "Record:\n   a: misfit\n   b: \nError reading a struct from output.\n   c: 1\n");
    EXPECT_EQ(TextOf(*formatters[2], record),
              "{\"a\": Error reading a int\n, \"b\": Error reading a struct from output.\n,"
              " \"c\": 1, }\n");
}

TEST(Formatters, AMissingValueIsNotRead) {
    const auto formatters = Formatters();
    EXPECT_EQ(TextOf(*formatters[0], nullptr), "");
    EXPECT_EQ(RootOf(TextOf(*formatters[1], nullptr)), "");
    EXPECT_EQ(TextOf(*formatters[2], nullptr),
              "throws: Invalid MetaObject passed to Format in PythonFormatter\n");
    EXPECT_EQ(TextOf(*formatters[3], nullptr), "Unknown data type\n\n");
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
    for (const auto& formatter : Formatters()) {
        Counter counter;
        std::ostream stream(&counter);
        Write(*formatter, value, stream);
        EXPECT_GT(counter.written, 8 * levels) << formatter->GetName();
    }
}

TEST(PythonFormatter, KnowsAsciiByTheTopBit) {
    EXPECT_TRUE(PythonFormatter::IsAllAscii(""));
    EXPECT_TRUE(PythonFormatter::IsAllAscii(std::string("\0a\x7f", 3)));
    EXPECT_FALSE(PythonFormatter::IsAllAscii("a\x80"));
}

}  // namespace AutoCli
