#include <tests/support/Split.h>
#include <zelmar/autocli/extension/ExtensionCommand.h>
#include <zelmar/metaobj/MetaObject.h>

#include <gtest/gtest.h>

#include <syslog.h>

#include <algorithm>
#include <cstdlib>
#include <optional>

using AutoCli::ExtensionCommand;
using CallSpec::Input;
using CallSpec::InputSpec;
using CallSpec::Output;
using CallSpec::ParameterSpec;

namespace {

class ExtensionCommandTest : public testing::Test {
protected:
    ExtensionCommandTest() {
        setenv("LANG", "", 1);
        _spec->AddParameter(ParameterSpec::New("name", CallSpec::ParameterTypeString));
        _command->SetInputSpec(_spec);
        _input->SetInputSpec(_spec);
    }
    ~ExtensionCommandTest() override {
        if (_language) {
            setenv("LANG", _language->c_str(), 1);
        } else {
            unsetenv("LANG");
        }
    }

    void Give(const std::string& name) {
        _input = Input::New();
        _input->SetInputSpec(_spec);
        _input->AddParameter("name", name);
    }

    // The value that the command gives, or its messages, one a line.
    std::string Execute(const std::string& execute, const std::string& stdinText = "") {
        _command->SetExecuteCommand(execute);
        _command->SetStdin(stdinText);
        const auto output = Output::New();
        _command->ExecuteInternal(_input, output);
        std::string result;
        for (const std::string& error : output->GetErrors()) {
            result += "[" + error + "]";
        }
        const auto value = output->GetRootObject();
        return value ? result + value->ToString() : result;
    }

    std::optional<std::string> _language =
        std::getenv("LANG") ? std::optional<std::string>(std::getenv("LANG")) : std::nullopt;
    std::shared_ptr<ExtensionCommand> _command = ExtensionCommand::New();
    std::shared_ptr<InputSpec> _spec = InputSpec::New();
    std::shared_ptr<Input> _input = Input::New();
};

TEST_F(ExtensionCommandTest, ReadsWhatTheProcessPrints) {
    _input->AddParameter("name", "a b");
    EXPECT_EQ(
        Execute("echo \"<o><string>$val{name}|$(cat)</string></o>\"; exit 3", "in $val{name}"),
        "a b|in a b");
    EXPECT_EQ(Execute("echo '<o/>'"), "");
}

TEST_F(ExtensionCommandTest, TakesErrorLinesAtTheHeadOfTheOutput) {
    EXPECT_EQ(Execute("printf 'ERROR:one\\nERROR: two\\n<x/>\\nERROR:three'"), "[one][ two]");
    EXPECT_EQ(Execute("printf 'ERROR:'"), "[]");
    EXPECT_EQ(Execute("printf 'ERROR:a\\nERROR:'"), "[a][]");
    EXPECT_EQ(Execute("printf 'ERROR:a\\n\\nERROR:b'"), "[a]");
}

TEST_F(ExtensionCommandTest, ReportsAProcessThatPrintsNothing) {
    const auto report = [](const std::string& line, const char* code) {
        return "[Got no data from process.\nCommand \"" + line +
               "\"\n\xd0\xb5xited with error code: " + code + "]";
    };
    EXPECT_EQ(Execute("exit 7"), report("exit 7", "7"));
    EXPECT_EQ(Execute("kill -9 $$"), report("kill -9 $$", "137"));
    unsetenv("LANG");
    const std::string percent = report("LANG=en_US.UTF-8 true %d", "0");
    openlog("log", LOG_PERROR, LOG_USER);
    setlogmask(LOG_MASK(LOG_ERR));
    testing::internal::CaptureStderr();
    EXPECT_EQ(Execute("true %d"), percent);
    EXPECT_EQ("[" + testing::internal::GetCapturedStderr(),
              "[log: " + percent.substr(1, percent.size() - 2) + "\n");
    setlogmask(LOG_UPTO(LOG_DEBUG));
    closelog();
}

TEST_F(ExtensionCommandTest, ReportsOutputThatDoesNotBuild) {
    EXPECT_EQ(Execute("echo '<o><meta-data/></o>'"),
              "[Unable to parse output of Extension Command: Error parsing command output.  Unable"
              " to build a proper metaobject from output tag.  output must contain properly"
              " formatted tags of type bool, int, string, structure and list. Error was : Unable to"
              " make a MetaObject from a node with tag 'meta-data']");
    testing::internal::CaptureStderr();
    EXPECT_EQ(Execute("echo '<o><int>1</int>'"), "");  // and no value: the declared output tells
    EXPECT_EQ(Execute("head -c 100000 /dev/urandom"), "");
    EXPECT_NE(testing::internal::GetCapturedStderr().find("STDOUT:"), std::string::npos);
}

TEST_F(ExtensionCommandTest, NamesTheSignalThatEndedAnUnfinishedOutput) {
    testing::internal::CaptureStderr();
    EXPECT_EQ(Execute("echo '<o><int>1</int>'; kill -9 $$"),
              "[The process of this command was ended by signal 9 (Killed)]");
    testing::internal::GetCapturedStderr();
    EXPECT_EQ(Execute("echo '<o><int>1</int></o>'; kill -9 $$"), "1");
}

TEST_F(ExtensionCommandTest, TellsTheProcessWhoAsksWhenItWantsToKnow) {
    const char* print = "printenv OX_USERNAME LANG | sed 's/.*/ERROR:&/'";
    unsetenv("LANG");
    _input->SetContext("user", "o'neil");
    EXPECT_EQ(Execute(print), "[en_US.UTF-8]");
    _spec->SetContextSupported("user");
    EXPECT_EQ(Execute(print), "[o'neil][en_US.UTF-8]");
    _input->SetContext("user", "");
    EXPECT_EQ(Execute(print), "[en_US.UTF-8]");
}

// Single quotes hold any value together, at the price of the single quotes in it.
TEST_F(ExtensionCommandTest, KeepsAQuotedValueInsideItsArgument) {
    auto values = Split(
        "$(echo x)%`echo x`%a;b%a&&b%|x%>/dev/full%\\\\'%';x;'%\";x;%${IFS}%a\\b%#;x%"
        "x y%{a,b}%*%<(x)%!!%-n",
        '%');
    for (int byte = 1; byte < 256; ++byte) {
        values.push_back(std::string("a") + static_cast<char>(byte) + "b");
    }
    for (const std::string& value : values) {
        Give(value);
        std::string argument = value;
        std::erase(argument, '\'');
        std::ranges::replace(argument, '\n', 'N');
        EXPECT_EQ(
            Execute("set -- '$val{name}'; printf 'ERROR:%d ' $#; printf %s \"$1\" | tr '\\n' N"),
            "[1 " + argument + "]")
            << testing::PrintToString(value);
    }
}

// What a careless template does. The form that is safe stands in the guide beside each.
TEST_F(ExtensionCommandTest, RunsWhatACarelessTemplateLetsThrough) {
    const std::pair<const char*, const char*> holes[] = {
        {": $val{name}", "#\necho ERROR:ran"},
        {":$multilist{name,-d,true}", "$(echo ERROR:ran >&3)"},
        {":$multilist{name,-d,true}", "`echo ERROR:ran >&3`"},
        {"echo $val{name} '$val{name}'", "ERROR:ran;:"},
    };
    for (const auto& [execute, value] : holes) {
        Give(value);
        EXPECT_EQ(Execute("exec 3>&1; " + std::string(execute)), "[ran]") << execute;
    }
}

}  // namespace
