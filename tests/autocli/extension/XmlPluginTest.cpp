// Descriptors, from the file to the tree.

#include <tests/support/Golden.h>
#include <tests/support/Schema.h>
#include <tests/support/Thrown.h>
#include <zelmar/autocli/extension/ExtensionCommand.h>
#include <zelmar/autocli/extension/XmlPlugin.h>

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <map>

using AutoCli::RootNamespace;
using AutoCli::XmlPlugin;

namespace {

const std::string version = "<version>1.0.0</version>";
const std::string nothing = Thrown([] {});

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
        const std::string message = Thrown([this] { XmlPlugin::New(_path)->Initialize(); });
        const std::string head =
            "Unable to handle XML Plugin " + _path + ".  There was an error while parsing: ";
        return message.starts_with(head) ? message.substr(head.size()) : message;
    }

    std::string LoadText(const std::string& text) {
        std::ofstream(_path, std::ios::binary) << text;
        return LoadFile();
    }

    std::string Register(const std::string& elements) {
        return Thrown([&] {
            Load("<plugin>" + version + elements + "</plugin>")->RegisterNamespaces(_root);
        });
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
        ASSERT_EQ(Register(text), nothing);
        const auto command =
            std::dynamic_pointer_cast<AutoCli::ExtensionCommand>(_root->GetNamespaceNode("cc"));
        EXPECT_EQ(command->SubstituteInput(CallSpec::Input::New(), false), execute) << content;
        EXPECT_EQ(command->SubstituteInput(CallSpec::Input::New(), true), "");
    }
}

// A line of data/faults.txt is a place in a descriptor: what stands there => what is said of it.
// What the schema takes loads, but for what it cannot say.
TEST_F(XmlPluginTest, TellsWhatIsWrong) {
    std::map<std::string, std::pair<std::string, std::string>> places;
    std::string head;
    std::string tail;
    const auto nest = [&](const char* place, const std::string& before, const char* after) {
        head += before;
        tail = after + tail;
        places[place] = {head, tail};
    };
    nest("file", "<plugin>", "</plugin>");
    nest("plugin", version, "");
    nest("command", "<commands><command path='a.b'>", "</command></commands>");
    nest("parameter", "<input-spec><parameter ",
         "</parameter></input-spec><output-spec><int/></output-spec><format-parameters/>"
         "<execute>x</execute>");
    nest("constraint",
         "name='nn' type='string' required='true'><description>d</description><constraint type=",
         "</constraint>");
    const std::string path = TESTS_DIR "/autocli/extension/data/faults.txt";
    std::ifstream faults(path);
    std::string told;
    const Schema schema("descriptor.xsd");
    std::string beyondSchema;
    for (std::string line; std::getline(faults, line);) {
        const size_t colon = line.find(": ");
        const size_t arrow = line.find(" => ");
        const auto& [before, after] = places.at(line.substr(0, colon));
        const std::string fault = line.substr(colon + 2, arrow - colon - 2);
        const std::string message = LoadText(before + fault + after);
        told += line.substr(0, arrow) + " => " + message + "\n";
        if (message != nothing && schema.IsValid(before + fault + after)) {
            beyondSchema += "\n" + fault;
        }
    }
    ExpectGolden(path, told);
    EXPECT_EQ(beyondSchema, R"(
name='nn' type='int' required='true' secret='true'><description>d</description>
name='nn' type='int' required='true'><description>d</description><constraint type='regex'><regex>x</regex></constraint>
'stringenum'><enum><enum-value value='a'>x<!--y--></enum-value></enum>
'intenum'><enum><enum-value value='a'>x</enum-value></enum>
'range'><range min='2' max='1'/>)");
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
              nothing);
    std::string wide = "\xff\xfe";
    for (const char c : "<p>" + version + "<namespaces/></p>") {
        wide += {c, '\0'};
    }
    EXPECT_EQ(LoadText(wide), nothing);
}

// What looks like an address is the name of a file, too.
TEST_F(XmlPluginTest, FetchesNothing) {
    std::ofstream(_path) << "<p>" << version << "<commands/></p>";
    for (const std::string& address :
         std::vector<std::string>{"file:" + _path, "file://" + _path, "/%2e/" + _path, "-",
                                  "http://127.0.0.1:9/x.xml"}) {
        EXPECT_THROW(XmlPlugin::New(address)->Initialize(), Zelmar::ZelmarException) << address;
    }
    EXPECT_EQ(LoadText("<!DOCTYPE p SYSTEM 'http://127.0.0.1:9/x' [<!ENTITY e SYSTEM '" + _path +
                       "'>]><p><version>&e;1.0.0</version><commands/></p>"),
              nothing);
}

TEST_F(XmlPluginTest, PutsWhatItHasIntoOneTree) {
    const std::string taken = "Kelvash path is already registered: ";
    const std::string absent = "Unable to find a command or namespace with the name '";
    const auto node = [](const std::string& path, const std::string& description) {
        return "<namespace path='" + path + "'><description>" + description +
               "</description></namespace>";
    };
    const std::pair<std::string, std::string> steps[] = {
        {NamespaceText("a", "A"), nothing},
        // Top-level namespaces of the same description are shared.
        {NamespaceText("a", "A") + CommandText("a.cc."), nothing},
        {NamespaceText("a", "B") + CommandText("dd"),
         "Duplicate top-level namespaces must have the same description: a"},
        {CommandText("dd") + NamespaceText("a.cc", "A"), taken + "a.cc"},
        {CommandText("a"), taken + "a"},
        {CommandText("a.cc.dd"),
         "Unable to find a namespace or command with the name 'dd' on the command 'a cc'. Commands"
         " cannot have sub-commands or sub-namespaces."},
        // Each parent comes before its children.
        {NamespaceText("b", "B") + CommandText("b.c.dd"), absent + "c' in namespace b"},
        {CommandText("b..dd"), absent + "' in namespace b"},
        {NamespaceText("B", "B"),
         "Invalid name for namespace 'B', must be a name consisting of letters and numbers and must"
         " conform to 'camel' casing."},
        {"<namespaces>" + node("t", "1") + node("t.s", "1") + node("t", "1") + "</namespaces>",
         nothing},
        {"<namespaces>" + node("u", "1") + node("u", "2") + "</namespaces>",
         "Duplicate registration in namespace  attempt to register two objects with name u"},
    };
    for (const auto& [elements, message] : steps) {
        const auto first = _root->GetNamespaceNode("a");
        EXPECT_EQ(Register(elements), message);
        EXPECT_TRUE(!first || _root->GetNamespaceNode("a") == first);
    }
    // What is taken shows before anything changes; what came before another failure stays.
    EXPECT_EQ(_root->GetNamespaceNodeNames(), std::vector<std::string>({"a", "b", "t", "u"}));
    EXPECT_TRUE(_root->GetNamespaceNode("a")->HasNamespaceNode("cc"));
}

TEST_F(XmlPluginTest, HasNoFormatters) {
    const auto plugin = XmlPlugin::New("some.xml");
    EXPECT_EQ(plugin->GetName(), "some.xml");
    EXPECT_FALSE(plugin->HasFormatter("table"));
    EXPECT_TRUE(plugin->GetFormatters().empty());
    EXPECT_THROW(plugin->GetFormatter("table"), Zelmar::ZelmarException);
}

}  // namespace
