// The template language, from worked examples to a comparison with its own expressions.

#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/ExtensionCommand.h>

#include <gtest/gtest.h>

#include <boost/regex.hpp>

#include <ctime>
#include <random>

using AutoCli::ExtensionCommand;
using CallSpec::Input;
using CallSpec::InputSpec;
using CallSpec::ParameterSpec;
using CallSpec::ParameterType;

namespace {

using Values = std::vector<std::string>;
using Given = std::map<std::string, Values>;

struct Call {
    std::shared_ptr<ExtensionCommand> command = ExtensionCommand::New();
    std::shared_ptr<Input> input = Input::New();
};

// Short names of parameters tell their type: lists begin with `l` and flags with `f`.
ParameterType TypeOf(const std::string& name) {
    return name[0] == 'l'   ? CallSpec::ParameterTypeStringList
           : name[0] == 'f' ? CallSpec::ParameterTypeFlag
                            : CallSpec::ParameterTypeString;
}

Call MakeCall(const std::string& text, const Given& given) {
    Call call;
    auto spec = InputSpec::New();
    for (const char* name :
         {"aa", "bb", "fa", "fb", "fx", "host", "la", "lb", "name", "other", "xx"}) {
        spec->AddParameter(ParameterSpec::New(name, TypeOf(name)));
    }
    call.command->SetInputSpec(spec);
    call.command->SetExecuteCommand(text);
    call.command->SetStdin(text);
    for (const auto& [name, values] : given) {
        for (const std::string& value : values) {
            call.input->AddParameter(name, value);
        }
    }
    call.input->SetInputSpec(spec);
    return call;
}

std::string Expand(const std::string& text, const Given& given, bool isStdin = false) {
    const Call call = MakeCall(text, given);
    return call.command->SubstituteInput(call.input, isStdin);
}

struct Example {
    const char* text;
    Given given;
    const char* expanded;
};

TEST(ExtensionTemplate, ReplacesItsForms) {
    const Example examples[] = {
        {"echo 'plain'", {{"name", {"x"}}}, "echo 'plain'"},
        {"'$val{xx}' $val{xx}", {{"xx", {"a;b'c"}}}, R"('a\;b\'c' a\;b\'c)"},
        {"$val{xx} '$val{xx}'", {{"xx", {"a;b'c"}}}, "a;bc 'a;bc'"},
        {"[$val{name}]", {{"name", {""}}}, "[]"},
        {"echo $val{other}", {}, "echo $val{other}"},
        {"foo $if{host,--host $val{host} --y}", {{"host", {"a}b"}}}, "foo --host ab --y}"},
        {"foo $if{xx,--a $val{bb} --c}", {{"xx", {""}}, {"bb", {"V"}}}, "foo --a V --c"},
        {"foo $if{aa,--a $val{bb} --c}", {{"aa", {""}}, {"bb", {"V"}}}, "foo --a $val{bb --c}"},
        {"foo $list{la,',',true}", {{"la", {"a", "b c"}}}, R"(foo "a,b c")"},
        {"$list{la,'ab',true} $list{la,',',yes}",
         {{"la", {"a"}}},
         "$list{la,'ab',true} $list{la,',',yes}"},
        {"$list{host,',',false}$multilist{host,-h,true}", {{"host", {"h"}}}, R"(h -h "h")"},
        {"foo$multilist{la,-d,true}", {{"la", {"a", "b\"c $x"}}}, R"(foo -d "a" -d "bc $x")"},
        {"foo$multilist{la,-d,false}", {{"la", {"a", "b\"c $x"}}}, R"(foo -d a -d b\"c \$x)"},
        // Leftovers, and what only looks like one.
        {"echo ${HOME} $if{fa,b}", {}, "echo ${HOME} "},
        {"$x { echo $if{fa,b}; }", {}, ""},
        {"$if{nobody,x}$if{Upper,x}", {}, "$if{Upper,x}"},
        // A value that spells a later form of its own, or another parameter.
        {"$val{aa}", {{"aa", {"$val{bb}"}}, {"bb", {"B"}}}, R"(\B)"},
    };
    for (const Example& example : examples) {
        EXPECT_EQ(Expand(example.text, example.given), example.expanded) << example.text;
    }
}

TEST(ExtensionTemplate, PutsValuesIntoTheStandardInputAsTheyAre) {
    const Given given = {{"name", {"a b'c\"$x"}}, {"la", {"a\"", ";b"}}};
    EXPECT_EQ(Expand("name='$val{name}'\n$if{host,host=$val{host}}", given, true),
              "name='a b'c\"$x'\n");
    EXPECT_EQ(Expand("$list{la,';',true}$multilist{la,;,true}$multilist{lb,-,true}", given, true),
              "\"a\";;b\" ; \"a\"\" ; \";b\"$multilist{lb,-,true}");
}

TEST(ExtensionTemplate, NeverLetsANulThrough) {
    const std::string nul(1, '\0');
    EXPECT_EQ(
        Expand("$val{name} $list{la,'',true}", {{"name", {"a" + nul + "b"}}, {"la", {nul, "x"}}}),
        R"(ab "x")");
}

TEST(ExtensionTemplate, RefusesToReadAFlagOrAListAsOneValue) {
    EXPECT_THROW(Expand("$val{fa}", {{"fa", {""}}}), Zelmar::ZelmarException);
    EXPECT_THROW(Expand("$val{la}", {{"la", {"x"}}}), Zelmar::ZelmarException);
    EXPECT_EQ(Expand("$val{fa}$val{la}", {}), "$val{fa}$val{la}");
}

// What the language is defined as: the expressions, one by one, and the erasing in place.
class ByExpressions {
public:
    ByExpressions(const std::string& text, const Given& given, bool isStdin)
        : _text(text), _given(given), _isStdin(isStdin) {}

    std::string Expand() {
        for (const auto& [name, values] : _given) {
            ExpandParameter(name, values);
        }
        RemoveLeftovers();
        return _text;
    }

private:
    void ExpandParameter(const std::string& name, const Values& values) {
        boost::smatch match;
        if (TypeOf(name) == CallSpec::ParameterTypeString &&
            Matches("(.*)\\$val\\{" + name + "\\}(.*)", match)) {
            const std::string before = match[1], after = match[2];
            const bool quoted = before.ends_with('\'') && after.starts_with('\'');
            Replace("\\$val\\{" + name + "\\}",
                    quoted && !_isStdin ? Without(values[0], '\'') : Escape(values[0]));
        }
        _text = boost::regex_replace(_text, boost::regex("\\$if\\{" + name + ",(.+?)\\}"), "$1");
        const std::string joined = "\\$list\\{" + name + ",'(.?)',(true|false)\\}";
        if (Matches(".*" + joined + ".*", match)) {
            std::string list;
            for (const std::string& value : values) {
                list += (&value == &values[0] ? "" : match[1].str()) + value;
            }
            const std::string quote = match[2] == "true" ? "\"" : "";
            Replace(joined, quote + Escape(list) + quote);
        }
        const std::string repeated = "\\$multilist\\{" + name + ",(.+?),(true|false)\\}";
        if (Matches(".*" + repeated + ".*", match)) {
            std::string list;
            for (const std::string& value : values) {
                list += " " + match[1] + " ";
                list += match[2] == "false" ? Escape(value)
                        : _isStdin          ? '"' + value + '"'
                                            : '"' + Without(value, '"') + '"';
            }
            Replace(repeated, list);
        }
    }

    void RemoveLeftovers() {
        const std::string leftover = R"(.*\$if\{[a-z0-9-]+,.+?\}.*)";
        size_t place = _text.find('{');
        if (!boost::regex_match(_text, boost::regex(leftover))) {
            return;
        }
        while (place < _text.size()) {
            const auto [start, size] =
                AutoCli::FindPairedTokenSize(_text.data(), place, _text.size(), '{', '}');
            const size_t dollar = _text.rfind('$', start);
            if (dollar != std::string::npos &&
                boost::regex_match(_text.substr(dollar, start + size - dollar),
                                   boost::regex(leftover))) {
                _text.erase(dollar, start + size - dollar);
            } else {
                place += size == 0 ? 1 : size;
            }
            place = _text.find('{', place);
        }
    }

    bool Matches(const std::string& expression, boost::smatch& match) const {
        return boost::regex_match(_text, match, boost::regex(expression));
    }

    void Replace(const std::string& expression, const std::string& with) {
        _text = boost::regex_replace(_text, boost::regex(expression), with,
                                     boost::regex_constants::format_literal);
    }

    [[nodiscard]] std::string Escape(const std::string& value) const {
        std::string escaped;
        for (const char c : value) {
            escaped +=
                !_isStdin && AutoCli::isBadChar(c) ? std::string("\\") + c : std::string(1, c);
        }
        return escaped;
    }

    static std::string Without(std::string value, char c) {
        std::erase(value, c);
        return value;
    }

    std::string _text;
    const Given& _given;
    const bool _isStdin;
};

class RandomText {
public:
    explicit RandomText(unsigned seed) : _random(seed) {}

    size_t Below(size_t limit) { return _random() % limit; }

    std::string Make(size_t longest) {
        static const std::string pieces[] = {
            "$val{aa}",       "$val{bb}",  "'",       "$if{aa,", "$if{fa,",
            "$if{zz,",        "$if{la,",   "{",       "}",       "}",
            "$list{la,'",     "$list{aa,", "',true}", ",true}",  "',false}",
            ",false}",        ",",         "a",       "$",       "\n",
            "$multilist{la,", "$if{",      "$i",      "f{x,y",   "-",
            "$multilist{bb,"};
        std::string text;
        for (size_t count = Below(longest + 1); count > 0; --count) {
            text += pieces[Below(std::size(pieces))];
        }
        return text;
    }

private:
    std::minstd_rand _random;
};

TEST(ExtensionTemplate, IsWhatItsExpressionsSay) {
    RandomText random(20);
    for (int round = 0; round < 20000; ++round) {
        const std::string text = random.Make(14);
        Given given;
        for (const char* name : {"aa", "bb", "fa", "la"}) {
            for (size_t count =
                     random.Below(TypeOf(name) == CallSpec::ParameterTypeStringList ? 3 : 2);
                 count > 0; --count) {
                given[name].push_back(random.Make(4));
            }
        }
        const bool isStdin = random.Below(2) == 0;
        ASSERT_EQ(Expand(text, given, isStdin), ByExpressions(text, given, isStdin).Expand())
            << text << "\naa=" << testing::PrintToString(given);
    }
}

// Each is a text that a scan which starts over at every brace or opening would not get through.
TEST(ExtensionTemplate, TakesTimeLinearInHostileValues) {
    const std::clock_t begin = std::clock();
    for (const char* piece : {"{", "}", "{}", "$", "'", "$if{aa,", "$if{zz,", "$multilist{lb,",
                              "$if{a{}", "$val{aa}", ",true}", "$if{x,y}", "\\"}) {
        std::string value = "$if{zz,$";
        while (value.size() < 1 << 18) {
            value += piece;
        }
        Expand(
            "'$val{aa}' \"$val{bb}\" $val{host} $list{la,',',true} $multilist{lb,-d,true} "
            "$if{fx,x}",
            {{"aa", {value}},
             {"bb", {value}},
             {"host", {value}},
             {"la", {value}},
             {"lb", {value}}});
    }
    EXPECT_LT((std::clock() - begin) / CLOCKS_PER_SEC, 20);
}

TEST(ExtensionTemplate, FindsTheEndOfASpan) {
    using Span = std::pair<unsigned long, unsigned long>;
    const auto find = [](const std::string& text, unsigned long start) {
        return AutoCli::FindPairedTokenSize(text.data(), start, text.size(), '{', '}');
    };
    EXPECT_EQ(find("a{b{c}d}e", 1), Span(1, 7));
    EXPECT_EQ(find("a{b{c}d}e", 2), Span(2, 6));
    EXPECT_EQ(find("{{}", 0), Span(0, 0));
    EXPECT_EQ(find("{{}", 1), Span(1, 2));
    EXPECT_EQ(find("", 0), Span(0, 0));
    EXPECT_EQ(find(std::string(1 << 20, '{'), 0), Span(0, 0));
}

TEST(ExtensionTemplate, KnowsTheCharactersThatTheShellReads) {
    std::string bad;
    for (int c = 0; c < 256; ++c) {
        if (AutoCli::isBadChar(static_cast<char>(c))) {
            bad += static_cast<char>(c);
        }
    }
    EXPECT_EQ(bad, "\n!\"$&'()*;<>\\^`|");
}

}  // namespace
