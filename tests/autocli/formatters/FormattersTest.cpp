// What holds for all formatters.

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
#include <sstream>

#include "Values.h"

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

}  // namespace

// data/<formatter>.txt holds the exact bytes, each value below a line "=== <its name>".
TEST(Formatters, SampleValuesGiveTheGoldenTexts) {
    const auto plugin = InternalPlugin::New();
    plugin->Initialize();
    for (const auto& formatter : plugin->GetFormatters()) {
        std::string texts;
        for (const auto& [name, value] : SampleValues()) {
            texts += "=== " + name + "\n" + TextOf(*formatter, value);
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
        Write(*formatter, SampleValues()["nested list"], stream);
        EXPECT_EQ(counter.flushes, std::ranges::count(counter.str(), '\n')) << formatter->GetName();

        counter.flushes = 0;
        {
            const BlockOutput blocks(stream);
            Write(*formatter, SampleValues()["nested list"], stream);
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
