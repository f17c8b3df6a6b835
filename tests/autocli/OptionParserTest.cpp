#include <tests/support/AllStrings.h>
#include <zelmar/autocli/OptionParser.h>
#include <zelmar/callspec/InputSpec.h>

#include <gtest/gtest.h>
#include <boost/regex.hpp>

#include <algorithm>

using CallSpec::InputSpec;
using CallSpec::ParameterSpec;

namespace AutoCli {
namespace {

using Words = std::vector<std::string>;

// --flag, --help and -h, --level and -l for an Int, --password and -p for a secret.
std::shared_ptr<InputSpec> Declaration() {
    auto spec = InputSpec::New();
    const auto add = [&spec](const char* name, const char* shortName,
                             CallSpec::ParameterType type) {
        auto parameter = ParameterSpec::New(name, type);
        parameter->SetShortName(shortName);
        spec->AddParameter(parameter);
        return parameter;
    };
    add("flag", "f", CallSpec::ParameterTypeFlag);
    add("help", "h", CallSpec::ParameterTypeBool);
    add("level", "l", CallSpec::ParameterTypeInt);
    add("password", "p", CallSpec::ParameterTypeString)->SetSecret(true);
    return spec;
}

std::string Dump(const std::vector<OptionParser::Option>& options) {
    std::string text;
    for (const auto& [name, value] : options) {
        text += "(" + name + "=" + value + ")";
    }
    return text;
}

// All four pieces of a line and the complaints, after both phases.
std::string Taken(OptionParser& parser, const std::shared_ptr<InputSpec>& spec) {
    parser.SetInputSpec(spec);
    std::string text = Dump(parser.GetDispatcherParameters());
    for (const std::string& word : parser.GetCommandPath()) {
        text += " " + word;
    }
    text += " " + Dump(parser.GetCommandParameters());
    for (const std::string& error : parser.GetParseErrors()) {
        text += "|" + error;
    }
    return text;
}

TEST(OptionParser, TellsOptionsAsTheirExpressionsDo) {
    const boost::regex any("^(-[a-zA-Z]|--([a-zA-Z][a-zA-Z0-9-]+)(=.+)?)$");
    const boost::regex kinds[] = {boost::regex("^-([a-zA-Z])$"),
                                  boost::regex("^--([a-zA-Z][a-zA-Z0-9-]+)$"),
                                  boost::regex("^--([a-zA-Z][a-zA-Z0-9-]+)=(.+)$")};
    OptionParser parser;
    ForEachString("-aZ1=\n", 6, [&](const std::string& word) {
        boost::smatch match;
        const bool isOption = std::ranges::any_of(
            kinds, [&](const auto& kind) { return boost::regex_match(word, match, kind); });
        std::string name = "old";
        std::string value = "old";
        const bool hasValue = parser.ParseParameter(word, name, value);
        EXPECT_EQ(OptionParser::IsParameter(word), boost::regex_match(word, any)) << word;
        EXPECT_EQ(hasValue, isOption && match.size() == 3) << word;
        EXPECT_EQ(name, isOption ? match.str(1) : "old") << word;
        EXPECT_EQ(value, hasValue ? match.str(2) : "old") << word;
    });
    EXPECT_EQ(parser.GetParseErrors().front(), "Attempt to parse option failed.  Input was : ");
    EXPECT_EQ(parser.GetParseErrors().back(),
              "Attempt to parse option failed.  Input was : \n\n\n\n\n\n");
}

TEST(OptionParser, TakesALineApartByPosition) {
    const std::pair<Words, const char*> cases[] = {
        {{}, " "},
        {{"--formatter", "json", "a", "b", "--xy", "1"}, "(formatter=json) a b (xy=1)"},
        {{"--formatter=json=x", "a"}, "(formatter=json=x) a "},
        {{"--flagword", "a", "b"}, "(flagword=a) b "},
        {{"-h", "a"}, "(h=a) "},
        {{"a", "-h"}, " a (h=)"},
        {{"a", "-x", "-5"}, " a (x=-5)"},
        {{"a", "-x", "-y", "-x", "1"}, " a (x=)(y=)(x=1)"},
        {{"a", "-x", "", "--", "b"},
         " a (x=)|Found Extra non-parameter arguments at the end of input: '--' 'b' "},
        {{"-q", "-", "--ab=", "-x"}, "(q=-) --ab= (x=)"},
        {{"a", "--level", "--flag", "-l", "-f", "--help", "-h"},
         " a (level=)(flag=)(l=)(f=)(help=)(h=)|--level must have value|-l must have value"},
        {{"a", "-l", "--unknown"}, " a (l=)(unknown=)|-l must have value"},
    };
    for (const auto& [words, pieces] : cases) {
        OptionParser parser;
        parser.ParseVector(words);
        EXPECT_EQ(Taken(parser, Declaration()), pieces);
        EXPECT_EQ(Taken(parser, Declaration()), pieces);
    }
}

TEST(OptionParser, SplitsALineIntoWords) {
    const std::pair<std::string, Words> cases[] = {
        {"", {}},
        {" \t ", {}},
        {"  # a", {}},
        {"\" # a\"", {}},
        {"\"", {}},
        {"\"\"", {}},
        {"a \"b c\" d", {"a", "b c", "d"}},
        {"a # b", {"a", "#", "b"}},
        {"a#b #", {"a#b", "#"}},
        {"a\tb  ", {"a", "b"}},
        {"ab\"c d\"e", {"abc de"}},
        {"a \"\" b", {"a", "", "b"}},
        {"a \"\"", {"a"}},
        {"a \"\" ", {"a", ""}},
        {"a \"b ", {"a", "b "}},
        {"\"  \ta\" b", {"\ta", "b"}},
        {"\"   a b\"", {" a b"}},
        {" \" a", {" a"}},
        {"a\\ b", {"a\\", "b"}},
        {"a\rb\vc", {"a\rb\vc"}},
    };
    for (const auto& [line, words] : cases) {
        OptionParser parser("tool");
        EXPECT_EQ(parser.ParseString(line), words.empty()) << line;
        EXPECT_EQ(Words(parser.GetNamespaces().begin(), parser.GetNamespaces().end()), words)
            << line;
        EXPECT_EQ(parser.GetDispatcher(), "tool");
    }
}

TEST(OptionParser, WithoutADeclarationNothingNeedsAValue) {
    OptionParser parser;
    const char* const argv[] = {"./bin/tool", "-q", "a", "b", "--level", "-p"};
    parser.ParseArgv(0, nullptr);
    EXPECT_EQ(parser.GetDispatcher(), "kelvash");
    parser.ParseArgv(6, argv);
    EXPECT_FALSE(parser.HasCommandParameter("nosuch"));
    EXPECT_EQ(Taken(parser, Declaration()), "(q=a) b (level=)(p=)");
    EXPECT_EQ(parser.GetDispatcherParameter("q"), Words({"a"}));
    EXPECT_EQ(parser.GetDispatcher(), "./bin/tool");
}

TEST(OptionParser, DumpsWhatItTook) {
    OptionParser parser;
    parser.ParseString("--formatter json a b -x 1 -x=2");
    EXPECT_EQ(parser.ToString(),
              "Parsed: 0\nDispatcher: kelvash\nErrors: \nPath: 'a''b'\nDispatch Params: \n"
              "   --formatter = 'json'\nCommand Params: \n   --x = '1'\n");
    EXPECT_EQ(parser.GetParseErrors(),
              Words({"Found Extra non-parameter arguments at the end of input: '-x=2' "}));
}

}  // namespace
}  // namespace AutoCli
