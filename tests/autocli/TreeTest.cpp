#include <tests/support/AllStrings.h>
#include <tests/support/TestCommand.h>
#include <tests/support/Thrown.h>
#include <zelmar/autocli/Namespace.h>

#include <gtest/gtest.h>
#include <boost/regex.hpp>

#include <chrono>

namespace AutoCli {
namespace {

using Path = std::list<std::string>;
using Names = std::vector<std::string>;

// a and a.b are namespaces, a.cmd is a command.
struct Tree {
    Tree() {
        root->RegisterNamespaceNode(a, "a");
        a->RegisterNamespaceNode(b, "b");
        a->RegisterNamespaceNode(command, "cmd");
    }

    std::string ResolvingError(Path path) const {
        const std::string text = Thrown([&] { (void)root->ResolveNode(path); });
        std::string rest;
        for (const std::string& name : path) {
            rest += " " + name;
        }
        return text + " |" + rest;
    }

    const std::shared_ptr<Namespace> root = RootNamespace::New(nullptr);
    const std::shared_ptr<Namespace> a = Namespace::New();
    const std::shared_ptr<Namespace> b = Namespace::New();
    const std::shared_ptr<TestCommand> command = TestCommand::New();
};

TEST(Tree, TheNameRuleAcceptsWhatItsExpressionDoes) {
    const boost::regex rule("([a-z0-9]+[A-Z0-9]{0,1})+");
    ForEachString("aB1-", 7, [&rule](const std::string& name) {
        EXPECT_EQ(AutoCli_IsValidName(name), boost::regex_match(name, rule)) << name;
    });
    for (const char* name : {"z_a", "a.b", "a b", "a\n", "\xc3\xa4"}) {
        EXPECT_FALSE(AutoCli_IsValidName(name)) << name;
    }
}

TEST(Tree, ALongBadNameIsRefusedAtOnce) {
    const std::string name = std::string(100'000, 'a') + "BB";
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(Thrown([&name] { Namespace::New()->SetName(name); }),
              "Invalid name for namespace '" + name +
                  "', must be a name consisting of letters and numbers and must conform to 'camel'"
                  " casing.");
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(1));
}

TEST(Tree, PathsRunFromTheRootDown) {
    const Tree tree;
    EXPECT_EQ(tree.b->GetPath(), Path({"a", "b"}));
    EXPECT_EQ(tree.command->GetPathString('.'), "a.cmd");
    EXPECT_EQ(tree.a->GetPathString('.'), "a");
    EXPECT_EQ(tree.root->GetPath(), Path());
    EXPECT_EQ(tree.root->GetPathString('.') + tree.root->GetName(), "");
}

TEST(Tree, ChildrenStandInByteOrderAndKeepTheirCase) {
    const auto root = RootNamespace::New(nullptr);
    for (const char* name : {"aa", "aB", "a1"}) {
        root->SubNamespace(name);
    }
    EXPECT_EQ(root->GetNamespaceNodeNames(), Names({"a1", "aB", "aa"}));
    EXPECT_FALSE(root->HasNamespaceNode("AA"));
    EXPECT_EQ(root->GetNamespaceNode("ab"), nullptr);
    EXPECT_EQ(root->SubNamespace("aa"), root->GetNamespaceNodes()[2]);
}

TEST(Tree, ResolvesAPathAndLeavesItAsItWas) {
    const Tree tree;
    Path path = {"a", "cmd"};
    EXPECT_EQ(tree.root->ResolveNode(path), tree.command);
    EXPECT_EQ(path, Path({"a", "cmd"}));
    Path none;
    EXPECT_EQ(tree.root->ResolveNode(none), nullptr);
}

TEST(Tree, AFailedResolvingNamesTheLevelAndLeavesTheRest) {
    const Tree tree;
    EXPECT_EQ(tree.ResolvingError({"x", "y"}),
              "Unable to find a command or namespace with the name 'x' in namespace  | y");
    EXPECT_EQ(tree.ResolvingError({"a", "x", "c"}),
              "Unable to find a command or namespace with the name 'x' in namespace a | c");
    EXPECT_EQ(tree.ResolvingError({"a", "b", "c"}),
              "Unable to find a command or namespace with the name 'c' in namespace a b |");
    EXPECT_EQ(tree.ResolvingError({"a", "cmd", "x", "y"}),
              "Unable to find a namespace or command with the name 'x y' on the command 'a cmd'."
              " Commands cannot have sub-commands or sub-namespaces. | x y");
}

TEST(Tree, ACommandHasNoChildren) {
    const Tree tree;
    EXPECT_FALSE(tree.command->HasNamespaceNode("x"));
    EXPECT_EQ(tree.command->GetNamespaceNodeNames(), Names());
    EXPECT_EQ(tree.a->SubNamespace("cmd"), tree.command);
}

}  // namespace
}  // namespace AutoCli
