// Descriptors, from the file to the tree.

#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/ExtensionCommand.h>
#include <zelmar/autocli/extension/XmlPlugin.h>

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

using AutoCli::RootNamespace;
using AutoCli::XmlPlugin;

namespace {

const std::string version = "<version>1.0.0</version>";

class XmlPluginTest : public testing::Test {
protected:
    void SetUp() override { testing::internal::CaptureStderr(); }
    void TearDown() override {
        testing::internal::GetCapturedStderr();
        std::filesystem::remove_all(_path);
    }

    std::shared_ptr<XmlPlugin> Load(const std::string& text) {
        std::ofstream(_path, std::ios::binary) << text;
        auto plugin = XmlPlugin::New(_path);
        plugin->Initialize();
        return plugin;
    }

    // What loading the file says, without what all these messages begin with.
    std::string LoadFile() {
        try {
            XmlPlugin::New(_path)->Initialize();
        } catch (const Zelmar::ZelmarException& error) {
            const std::string head =
                "Unable to handle XML Plugin " + _path + ".  There was an error while parsing: ";
            const std::string message = error.what();
            return message.starts_with(head) ? message.substr(head.size()) : "?" + message;
        }
        return "";
    }

    std::string LoadText(const std::string& text) {
        std::ofstream(_path, std::ios::binary) << text;
        return LoadFile();
    }

    std::string LoadPlugin(const std::string& elements) {
        return LoadText("<plugin>" + version + elements + "</plugin>");
    }

    // The same for one command "a.b", without what those messages begin with.
    std::string LoadCommand(const std::string& elements) {
        const std::string message =
            LoadPlugin("<commands><command path='a.b'>" + elements + "</command></commands>");
        const std::string head = "Unable to register the command 'kelvash a.b'  Error was ";
        return message.starts_with(head) ? message.substr(head.size()) : message;
    }

    std::string Register(const std::string& elements) {
        try {
            Load("<plugin>" + version + elements + "</plugin>")->RegisterNamespaces(_root);
        } catch (const Zelmar::ZelmarException& error) {
            return error.what();
        }
        return "";
    }

    const std::string _path = (std::filesystem::temp_directory_path() /
                               ("xml-plugin-" + std::to_string(getpid()) + ".xml"))
                                  .string();
    std::shared_ptr<RootNamespace> _root = RootNamespace::New(nullptr);
};

std::string NamespaceText(const std::string& path, const std::string& description) {
    return "<namespaces><namespace path='" + path + "'><description>" + description +
           "</description></namespace></namespaces>";
}

std::string CommandText(const std::string& path) {
    return "<commands><command path='" + path +
           "'><input-spec/><output-spec/><format-parameters/><execute>x</execute></command>"
           "</commands>";
}

TEST_F(XmlPluginTest, ReadsACommandWithAllItsParts) {
    // The root has any name, commands may come first, and what is unknown is passed over.
    const auto plugin = Load(R"(<anything><commands><command path="disk.list"><unknown/>
        <description>List them</description>
        <meta-data>text<!-- c --><![CDATA[x]]><meta-data-entry name="n">x</meta-data-entry>
          <meta-data-entry/></meta-data>
        <input-spec>
          <parameter name="size" type="int-list" required="true" shortname="s">
            <description>Sizes from %ENUM%</description>
            <constraint type="range"><range min="1" max="9"/></constraint>
            <constraint type="intenum"><unknown/><enum><enum-value value="9">x</enum-value></enum>
              <enum><enum-value value=" 2x">two</enum-value><enum-value value="3"/></enum>
            </constraint>
          </parameter>
          <parameter name="key" type="string" required="false" secret="true">
            <description></description><description>Key</description>
            <constraint type="stringenum"><enum><enum-value value="k">a key</enum-value></enum>
            </constraint></parameter>
          <parameter name="all" type="flag" required="false"><description>x</description></parameter>
          <context-supported>user</context-supported><context-supported>site</context-supported>
        </input-spec>
        <output-spec>text<list type="string"/><!-- c --></output-spec>
        <format-parameters><formatter>table</formatter><other/>
          <format-parameter name="a">1</format-parameter></format-parameters>
        <execute>first</execute></command></commands>
        <namespaces><namespace path="disk"><description>Disks</description></namespace></namespaces>
        <version/><version>1.0.0</version></anything>)");
    plugin->RegisterNamespaces(_root);
    EXPECT_EQ(_root->GetNamespaceNode("disk")->GetDescription(), "Disks");
    const auto node = _root->GetNamespaceNode("disk")->GetNamespaceNode("list");
    const auto command = std::dynamic_pointer_cast<AutoCli::ExtensionCommand>(node);
    ASSERT_TRUE(command);
    std::string told = command->GetDescription() + "\n";
    for (const auto& parameter : command->GetInputSpec()->GetParameterSpecs()) {
        told += parameter->GetName() + "|" + parameter->GetShortName() + "|" +
                std::to_string(parameter->GetType()) + (parameter->IsRequired() ? "r" : "") +
                (parameter->IsSecret() ? "s" : "") + "|" + parameter->GetDescription(true) + "|" +
                (parameter->GetConstraint() ? parameter->GetConstraint()->ToString() : "none") +
                "\n";
    }
    EXPECT_EQ(told,
              "List them\n"
              "all||3|x|none\n"
              "help|h|2|Show the help message.|none\n"
              "key||0s|Key|[k]\n"
              "size|s|5r|Sizes from [2]|[2]\n");
    EXPECT_TRUE(command->GetInputSpec()->IsContextSupported("user"));
    EXPECT_TRUE(command->GetInputSpec()->IsContextSupported("site"));
    EXPECT_EQ(command->GetOutputSpec()->GetRootObject()->GetType(), MetaObj::MetaType::List);
    EXPECT_EQ(command->GetDefaultOutputFormatParameters().GetFormatter(), "table");
    EXPECT_EQ(command->GetDefaultOutputFormatParameters().GetParameters(),
              (std::map<std::string, std::string>{{"a", "1"}}));
}

// A comment behind the text, or a line break behind a CDATA section, is what is read.
TEST_F(XmlPluginTest, TakesTheLastTextOfAnElement) {
    const std::pair<const char*, const char*> cases[] = {
        {"text<!--comment-->", "comment"}, {"text<a/>\n", "\n"}, {"<![CDATA[data]]>\n", "\n"},
        {"<![CDATA[data]]>", "data"},      {" text ", " text "}, {"a &lt; b", "a < b"},
    };
    for (const auto& [content, execute] : cases) {
        auto text = CommandText("cc");
        text.replace(text.find(">x<") + 1, 1, content);
        _root = RootNamespace::New(nullptr);
        ASSERT_EQ(Register(text), "");
        const auto command =
            std::dynamic_pointer_cast<AutoCli::ExtensionCommand>(_root->GetNamespaceNode("cc"));
        EXPECT_EQ(command->SubstituteInput(CallSpec::Input::New(), false), execute) << content;
        EXPECT_EQ(command->SubstituteInput(CallSpec::Input::New(), true), "");
    }
}

TEST_F(XmlPluginTest, TellsWhatIsWrongWithADescriptor) {
    const std::string badVersion =
        "Unknown kelvash extention version.  Valid versions are: '1.0.0'";
    const std::string badNamespace =
        "Unable to register a namespace without valid 'path' attribute or <description> being"
        " present.";
    const std::pair<std::string, std::string> cases[] = {
        {"<p><commands/></p>", badVersion},
        {"<p><version> 1.0.0</version><commands/></p>", badVersion},
        {"<p>" + version + version + "</p>",
         "Illegal Duplicate tags found.  The tag version was expected only once, but was found"
         " multiple times."},
        {"<p>" + version + "<Commands/></p>",
         "Unable to find any namespaces or commands to register for plugin " + _path},
        {"<p>" + version + "<namespaces/></p>", ""},
        {"<p>" + version + "<commands/><commands/></p>",
         "More than one instance of commands found, expected only one."},
        {"<p>" + version + NamespaceText("a", "") + "</p>", badNamespace},
        {"<p>" + version + NamespaceText("", "a") + "</p>", badNamespace},
        {"<p>" + version + CommandText("") + "</p>",
         "Invalid command specification found.  <command> tags must have a non-empty 'path'"
         " attribute"},
    };
    for (const auto& [text, message] : cases) {
        EXPECT_EQ(LoadText(text), message) << text;
    }
}

TEST_F(XmlPluginTest, TellsWhatIsWrongWithACommand) {
    const std::string input = "<input-spec/>";
    const std::string output = "<output-spec/>";
    const std::string format = "<format-parameters/>";
    const std::string execute = "<execute>x</execute>";
    const std::string missingExecute =
        "Missing or empty <execute> tag.  This tag must specify a valid execution string for this"
        " command.";
    const std::pair<std::string, std::string> cases[] = {
        {input + output + format + execute, ""},
        {output + format + execute,
         "Unable to find <input-spec> element, which is required for a command."},
        {input + format + execute,
         "Unable to find <output-spec> element, which is required for a command."},
        {input + output + execute,
         "Unable to find <format-parameters> element, which is required for a command."},
        {input + output + format, missingExecute},
        {input + output + format + "<execute/>", missingExecute},
        {input + input, "More than one instance of input-spec found, expected only one."},
        {"<meta-data><other/></meta-data>",
         "Found unexpected tag while building meta-data set.  Unexpected tag was: other"},
        {"<meta-data><meta-data-entry>x</meta-data-entry></meta-data>",
         "Error parsing 'meta-data-entry', missing required attribute 'name'"},
        {input + "<output-spec><int/><bool/></output-spec>",
         "Found more than one node under 'output-spec', where only one node is supported.  The tag"
         " was bool"},
        {input + "<output-spec><other/></output-spec>",
         "Unable to build output spec.  Error was Unable to make a MetaObject from a node with tag"
         " 'other'"},
        {input + output + "<format-parameters><formatter/><formatter/></format-parameters>",
         "Invalid plugin format.  Duplicate <formatter> tags found"},
    };
    for (const auto& [elements, message] : cases) {
        EXPECT_EQ(LoadCommand(elements), message) << elements;
    }
    // Messages that come before the command has a name to show.
    EXPECT_EQ(LoadCommand("<description>a</description><description>b</description>"),
              "Illegal Duplicate tags found.  The tag description was expected only once, but was"
              " found multiple times.");
}

TEST_F(XmlPluginTest, TellsWhatIsWrongWithAParameter) {
    const std::string description = "<description>d</description>";
    const std::pair<std::string, std::string> cases[] = {
        {">", "Unable to parse Input Parameter.  Missing required attribute: 'name'"},
        {"name='nn' type='text'>",
         "Unable to parse Input Parameter nn. Missing or invalid required attribute: 'type'.  Must"
         " be one of [string, string-list, bool, bool-list, int, int-list]"},
        {"name='nn' type='int'>",
         "Unable to parse Input Paramter nn. Missing or invalid 'required', must be one of ['true',"
         " 'false']"},
        {"name='nn' type='int' required='true'>",
         "Unable to parse Input Paramter nn. Missing command description"},
        {"name='nn' type='int' required='true' secret='x'>" + description,
         "Unable to parse Input Paramter nn. Invalid 'secret', must be one of ['true', 'false']"},
        {"name='nn' type='int' required='true' secret='true'>" + description,
         "Unable to parse Input Paramter nn. Invalid type int for secret, must be 'string'"},
        {"name='N' type='int' required='true'>" + description,
         "Invalid Parameter name 'N' parameter names can only contain lower-case alphanumeric"
         " characters, numbers and '-'"},
        {"name='nn' type='int' required='true' shortname='xy'>" + description,
         "Invalid value for shortName, must be a single character a-z, A-Z or 0-9"},
        {"name='nn' type='int' required='true'>" + description +
             "<constraint type='regex'><regex>x</regex></constraint>",
         "Unable to build parameter constraint for parameter nn.  Error was: Invalid constraint"
         " specified for parameter nn.  The parameter constraint specified is not allowed for a"
         " parameter of this type."},
    };
    for (const auto& [text, message] : cases) {
        EXPECT_EQ(LoadCommand("<input-spec><parameter " + text + "</parameter></input-spec>"),
                  message)
            << text;
    }
}

TEST_F(XmlPluginTest, TellsWhatIsWrongWithAConstraint) {
    const std::string noData =
        "Error parsing parameter constraint.  There was no data included inside the <constraint>"
        " tag for the given constraint type";
    const std::string badRange =
        "Error parsing 'range' parameter constraint.  Range requires both 'min' and 'max'"
        " attributes and that both are integers.";
    const std::pair<std::string, std::string> cases[] = {
        {"''>",
         "Missing or invalid constraint 'type', must be one of [stringenum, intenum, regex,"
         " range] got ''"},
        {"'x'>",
         "Missing or invalid constraint 'type', must be one of [stringenum, intenum, regex,"
         " range] got 'x'"},
        {"'regex'><enum/>", noData},
        {"'stringenum'><enum><enum-value value='a'/></enum>", noData},
        {"'stringenum'><enum><other/></enum>",
         "Found unexpected tag while building an enum.  Unexpected tag was: other"},
        {"'stringenum'><enum><enum-value>a</enum-value></enum>",
         "Error parsing 'enum-value', missing required attribute 'value'"},
        {"'stringenum'><enum><enum-value value='a'>x<!--y--></enum-value></enum>",
         "Duplicate Value found in ParameterConstraint::AddStringEnum: a"},
        {"'intenum'><enum><enum-value value='a'>x</enum-value></enum>",
         "Error parsing integer enumeration. Expected integer, but got a"},
        {"'regex'><regex/>",
         "Error parsing regex from parameter constraint.Missing or empty 'regex' tag"},
        {"'range'><range min='1'/>", badRange},
        {"'range'><range min='1' max='x'/>", badRange},
        {"'range'><range min='2' max='1'/>",
         "Invalid values for SetIntRange, constraints must have a min value <= max value"},
    };
    for (const auto& [text, message] : cases) {
        EXPECT_EQ(LoadCommand("<input-spec><parameter name='nn' type='string' required='true'>"
                              "<description>d</description><constraint type=" +
                              text + "</constraint></parameter></input-spec>"),
                  "Unable to build parameter constraint for parameter nn.  Error was: " + message)
            << text;
    }
}

TEST_F(XmlPluginTest, RefusesFilesThatAreNoDescriptors) {
    const std::string unreadable = "Unable to parse XML descriptor: " + _path;
    EXPECT_EQ(LoadFile(), unreadable);
    std::string large;
    large.resize(50'000'000, 'x');
    for (const std::string& text : {std::string(),
                                    std::string("\x7f"
                                                "ELF\0\1\2",
                                                7),
                                    std::string("<p>"), std::string("<p>\xe9</p>"), large}) {
        EXPECT_EQ(LoadText(text), unreadable);
    }
    std::string deep;
    for (int level = 0; level < 10000; ++level) {
        deep += "<p>";
    }
    EXPECT_EQ(LoadText(deep), unreadable);
    std::filesystem::remove(_path);
    std::filesystem::create_directory(_path);
    EXPECT_EQ(LoadFile(), unreadable);
}

TEST_F(XmlPluginTest, ReadsOtherEncodings) {
    EXPECT_EQ(LoadText("<?xml version='1.0' encoding='ISO-8859-1'?><p>" + version +
                       NamespaceText("a", "\xe9") + "</p>"),
              "");
    std::string wide = "\xff\xfe";
    for (const char c : "<p>" + version + "<namespaces/></p>") {
        wide += {c, '\0'};
    }
    EXPECT_EQ(LoadText(wide), "");
}

// What looks like an address is the name of a file, too.
TEST_F(XmlPluginTest, FetchesNothing) {
    EXPECT_THROW(XmlPlugin::New("http://127.0.0.1:9/x.xml")->Initialize(), Zelmar::ZelmarException);
    EXPECT_EQ(LoadText("<!DOCTYPE p SYSTEM 'http://127.0.0.1:9/x' [<!ENTITY e SYSTEM '" + _path +
                       "'>]><p><version>&e;1.0.0</version><commands/></p>"),
              "");
}

TEST_F(XmlPluginTest, SharesTopLevelNamespacesOfTheSameDescription) {
    EXPECT_EQ(Register(NamespaceText("a", "A")), "");
    const auto first = _root->GetNamespaceNode("a");
    EXPECT_EQ(Register(NamespaceText("a", "A") + CommandText("a.cc.")), "");
    EXPECT_EQ(_root->GetNamespaceNode("a"), first);
    EXPECT_TRUE(first->HasNamespaceNode("cc"));
    EXPECT_EQ(Register(NamespaceText("a", "B") + CommandText("dd")),
              "Duplicate top-level namespaces must have the same description: a");
    EXPECT_EQ(Register(CommandText("dd") + NamespaceText("a.cc", "A")),
              "Kelvash path is already registered: a.cc");
    EXPECT_EQ(Register(CommandText("a")), "Kelvash path is already registered: a");
    EXPECT_EQ(Register(CommandText("a.cc.dd")),
              "Unable to find a namespace or command with the name 'dd' on the command 'a cc'."
              " Commands cannot have sub-commands or sub-namespaces.");
    EXPECT_FALSE(_root->HasNamespaceNode("dd"));  // what is taken shows before anything changes
}

TEST_F(XmlPluginTest, NeedsEachParentBeforeItsChildren) {
    EXPECT_EQ(Register(NamespaceText("a", "A") + CommandText("a.b.cc")),
              "Unable to find a command or namespace with the name 'b' in namespace a");
    EXPECT_TRUE(_root->HasNamespaceNode("a"));  // what came before stays
    EXPECT_EQ(Register(CommandText("a..b")),
              "Unable to find a command or namespace with the name '' in namespace a");
    EXPECT_EQ(Register(NamespaceText("B", "B")),
              "Invalid name for namespace 'B', must be a name consisting of letters and numbers and"
              " must conform to 'camel' casing.");
    const std::string twice = "<namespace path='t'><description>1</description></namespace>";
    EXPECT_EQ(Register("<namespaces>" + twice + twice + "</namespaces>"), "");
    EXPECT_EQ(Register("<namespaces><namespace path='u'><description>1</description></namespace>"
                       "<namespace path='u'><description>2</description></namespace></namespaces>"),
              "Duplicate registration in namespace  attempt to register two objects with name u");
}

TEST_F(XmlPluginTest, HasNoFormatters) {
    const auto plugin = XmlPlugin::New("some.xml");
    EXPECT_EQ(plugin->GetName(), "some.xml");
    EXPECT_FALSE(plugin->HasFormatter("table"));
    EXPECT_TRUE(plugin->GetFormatters().empty());
    EXPECT_THROW(plugin->GetFormatter("table"), Zelmar::ZelmarException);
}

}  // namespace
