#include <tests/support/TestCommand.h>
#include <tests/support/Thrown.h>
#include <zelmar/autocli/CommandInput.h>
#include <zelmar/autocli/Dispatcher.h>
#include <zelmar/metaobj/MetaList.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>

using CallSpec::Output;
using CallSpec::ParameterSpec;
using MetaObj::MetaString;
using Zelmar::ZelmarException;

namespace AutoCli {
namespace {

using Texts = std::vector<std::string>;
using OutputPointer = std::shared_ptr<Output>;

const std::string implementationError =
    "Implementation error! The output of this command does not match the declared output type, see"
    " errors above.";

class DispatcherTest : public testing::Test {
protected:
    std::shared_ptr<CommandInput> InputFor(std::list<std::string> path) {
        auto input = CommandInput::New();
        input->SetCommandPath(path);
        return input;
    }

    Texts Execute(const std::shared_ptr<CommandInput>& input) {
        output = CommandOutput::New();
        const bool succeeded = dispatcher.ExecuteCommand(input, output);
        EXPECT_EQ(succeeded, output->GetErrors().empty());
        return output->GetErrors();
    }

    // Registers the command as `a b`, or another letter, and runs it.
    Texts Run(const std::shared_ptr<TestCommand>& command, char letter = 'b') {
        const std::string name(1, letter);
        dispatcher.GetRootNamespace()->SubNamespace("a")->RegisterNamespaceNode(command, name);
        return Execute(InputFor({"a", name}));
    }

    Dispatcher dispatcher;
    std::shared_ptr<CommandOutput> output;
};

TEST_F(DispatcherTest, NamesWhyAPathLeadsToNoCommand) {
    EXPECT_EQ(Execute(InputFor({})), Texts({"Unable to find command"}));
    EXPECT_EQ(Execute(InputFor({"kelvash", "command"})),
              Texts({"Path refers to a namespace, not a command."}));
    EXPECT_EQ(Execute(InputFor({"kelvash", "nosuch", "x"})),
              Texts({"Unable to find a command or namespace with the name 'nosuch' in namespace"
                     " kelvash",
                     "Unable to find command"}));
    EXPECT_EQ(dispatcher.GetDefaultOutputFormatParameters(InputFor({}), output).GetFormatter(), "");
    EXPECT_EQ(output->GetErrors().back(), "Unable to find command");
}

TEST_F(DispatcherTest, JudgesWhatACommandDelivers) {
    const std::pair<TestCommand::Work, Texts> cases[] = {
        {TestCommand::Answer, {}},
        {[](const OutputPointer& out) {
             out->AddErrorMessage("first");
             throw std::out_of_range("boom");
         },
         {"first", "Error on command a c : boom"}},
        {[](const OutputPointer& out) { out->SetRootObject(MetaString::New("x")); },
         {"Type mismatch in structure.  Expecting Int got String", implementationError}},
        {[](const OutputPointer&) {},
         {"No root object set for output. The command did not provide proper output.",
          implementationError}},
    };
    std::string delivered;
    char name = 'b';
    for (const auto& [work, complaints] : cases) {
        EXPECT_EQ(Run(TestCommand::New(work), name++), complaints);
        const auto value = output->GetRootObject();
        delivered += value ? value->ToString() + " " : "none ";
    }
    EXPECT_EQ(delivered, "42 none x none ");
}

TEST_F(DispatcherTest, LabelsACallWithoutAPathWithTheCommandsName) {
    const auto command = TestCommand::New([](const OutputPointer&) { throw ZelmarException("x"); });
    command->SetName("cmd");
    const auto plain = Output::New();
    command->Execute(CallSpec::Input::New(), plain);
    EXPECT_EQ(plain->GetErrors(), Texts({"Error on command cmd : x"}));
    const auto thrower = TestCommand::New([](const OutputPointer&) { throw 1; });
    EXPECT_THROW(thrower->Execute(CallSpec::Input::New(), plain), int);
}

TEST_F(DispatcherTest, RunsNoCommandOnBadInputAndHelpsInstead) {
    const auto size = ParameterSpec::New("size", CallSpec::ParameterTypeInt);
    size->SetShortName("s");
    const auto command = TestCommand::New(TestCommand::Answer, {size});
    EXPECT_EQ(Run(command), Texts({"Missing required parameter --size"}));
    const auto twice = InputFor({"a", "b"});
    twice->AddParameter("s", "1");
    twice->AddParameter("size", "2");
    EXPECT_EQ(Execute(twice), Texts({"Found multiple values for size this parameter can only accept"
                                     " a single value."}));
    const auto help = InputFor({"a", "b"});
    help->AddParameter("h", "");
    help->AddParameter("zeta", "");
    EXPECT_EQ(Execute(help), Texts());
    EXPECT_EQ(output->GetOutputType(), Output::OutputTypeHelp);
    EXPECT_EQ(command->executed, 0);
    EXPECT_EQ(command->declared, 1);
}

TEST_F(DispatcherTest, ACommandThatDeclaresHelpItselfFailsOnce) {
    const auto command = TestCommand::New(
        TestCommand::Answer, {ParameterSpec::New("help", CallSpec::ParameterTypeFlag)});
    EXPECT_EQ(Thrown([&] { Run(command); }),
              "Found a duplicate paramater specification for parameter named 'help'");
    EXPECT_EQ(command->GetInputSpec()->GetParameterSpecs().size(), 1U);
}

TEST_F(DispatcherTest, ListsTheCommandsThatPassAllFilters) {
    const auto root = dispatcher.GetRootNamespace();
    root->SubNamespace("a")->RegisterNamespaceNode(TestCommand::New(), "z");
    root->SubNamespace("a")->SubNamespace("b")->RegisterNamespaceNode(TestCommand::New(), "c");
    root->RegisterNamespaceNode(TestCommand::New(), "top");
    root->SubNamespace("empty");
    const std::string own =
        "{'Command' => 'list', 'Description' => 'List all of the kelvash"
        " commands.', 'Namespace' => 'kelvash.command', }";
    const auto row = [](const char* path, const char* name) {
        return "{'Command' => '" + std::string(name) + "', 'Description' => '', 'Namespace' => '" +
               path + "', }";
    };
    const std::pair<std::vector<std::pair<const char*, const char*>>, std::string> cases[] = {
        {{}, row("a.b", "c") + ", " + row("a", "z") + ", " + own + ", " + row("", "top")},
        {{{"n", "sh.com"}}, own},
        {{{"n", "Command"}}, ""},
        {{{"command-filter", "i"}}, own},
        {{{"c", "list"}, {"d", "nothing"}}, ""},
        {{{"n", "a"}, {"c", "z"}}, row("a", "z")},
    };
    for (const auto& [filters, rows] : cases) {
        const auto input = InputFor({"kelvash", "command", "list"});
        for (const auto& [name, value] : filters) {
            input->AddParameter(name, value);
        }
        EXPECT_EQ(Execute(input), Texts());
        EXPECT_EQ(output->GetRootObject()->ToString(), rows);
    }
}

// Writes a word and answers false.
class WordFormatter : public Formatter {
public:
    using Formatter::Formatter;
    bool Format(const OutputPointer& /*output*/, FormatParameters& /*parameters*/,
                DisplayContext& /*context*/, std::ostream& stream) override {
        stream << "word" << std::endl;
        return false;
    }
};

// A plugin that brings formatters and a node under a name that may be taken.
class TestPlugin : public Plugin {
public:
    TestPlugin(std::string node, const Texts& formatters) : _node(std::move(node)) {
        for (const std::string& name : formatters) {
            _formatters.push_back(std::make_shared<WordFormatter>(name));
        }
    }

    void Initialize() override {}
    const std::string& GetName() const override { return _name; }
    void RegisterNamespaces(std::shared_ptr<Namespace> root) override {
        root->RegisterNamespaceNode(Namespace::New(), _node);
    }
    bool HasFormatter(const std::string& name) override { return GetFormatter(name) != nullptr; }
    std::shared_ptr<Formatter> GetFormatter(const std::string& name) override {
        const auto found = std::ranges::find(
            _formatters, name, [](const auto& formatter) { return formatter->GetName(); });
        return found == _formatters.end() ? nullptr : *found;
    }
    const std::vector<std::shared_ptr<Formatter>>& GetFormatters() override { return _formatters; }

private:
    const std::string _name = "Test";
    const std::string _node;
    std::vector<std::shared_ptr<Formatter>> _formatters;
};

TEST_F(DispatcherTest, TakesAPluginWithItsFormattersAndNodes) {
    dispatcher.RegisterPlugin(std::make_shared<TestPlugin>("good", Texts{"word"}));
    EXPECT_EQ(dispatcher.GetPluginNames(), Texts({"Internal", "Test"}));
    Texts names;
    for (const auto& formatter : dispatcher.GetFormatters()) {
        names.push_back(formatter->GetName());
    }
    EXPECT_EQ(names, Texts({"commandhelp", "json", "python", "simple", "table", "word", "xml"}));
    dispatcher.ResetRegistrations();
    EXPECT_EQ(dispatcher.GetPluginNames(), Texts());
    EXPECT_EQ(dispatcher.GetRootNamespace()->GetNamespaceNodeNames(), Texts({"good", "kelvash"}));
    EXPECT_FALSE(dispatcher.HasFormatter("Word"));
    output = CommandOutput::New();
    std::ostringstream stream;
    DisplayContext context;
    const auto print = [&](const char* formatter) {
        FormatParameters parameters;
        parameters.SetFormatter(formatter);
        return dispatcher.FormatOutput(output, parameters, context, stream);
    };
    EXPECT_TRUE(print(""));
    EXPECT_TRUE(print("word"));  // whatever the formatter answers
    EXPECT_FALSE(print("clihelp"));
    EXPECT_EQ(stream.str(), "word\n");
    EXPECT_EQ(output->GetErrors(), Texts({"Unable to find requested formatter: clihelp"}));
}

TEST_F(DispatcherTest, RefusesAPluginWhoseNamesAreTaken) {
    const auto refusal = [this](const char* node, const Texts& formatters) {
        const auto plugin = std::make_shared<TestPlugin>(node, formatters);
        return Thrown([&] { dispatcher.RegisterPlugin(plugin); });
    };
    const auto builtIn = dispatcher.GetFormatter("table");
    EXPECT_EQ(refusal("kelvash", {}),
              "Error while trying to register the plugin Test Duplicate registration in namespace "
              " attempt to register two objects with name kelvash The functionality in Test will"
              " not be available until this issue is resolved.");
    EXPECT_EQ(refusal("form", {"word", "table"}),
              "Error while trying to register the plugin Test  this plugin has a formatter table"
              " that was already registered from the plugin Internal  The functionality in Test"
              " will not be available until this issue is resolved.");
    EXPECT_EQ(dispatcher.GetPluginNames(), Texts({"Internal"}));
    EXPECT_EQ(dispatcher.GetFormatter("table"), builtIn);
    EXPECT_FALSE(dispatcher.HasFormatter("word"));
}

}  // namespace
}  // namespace AutoCli
