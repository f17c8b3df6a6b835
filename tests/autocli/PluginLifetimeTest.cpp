// Nodes of a plugin hold its code: whatever becomes of the plugin, its object must stay loaded for
// as long as the tree, and go with it.

#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/Dispatcher.h>

#include <dlfcn.h>
#include <gtest/gtest.h>

namespace AutoCli {
namespace {

using Names = std::vector<std::string>;

const std::string goodPlugin = TEST_PLUGIN_DIR "/registered.so";
const std::string failingPlugin = TEST_PLUGIN_DIR "/half_registered.so";

bool IsLoaded(const std::string& path) {
    const std::unique_ptr<void, int (*)(void*)> handle(
        dlopen(path.c_str(), RTLD_LAZY | RTLD_NOLOAD), &dlclose);
    return handle != nullptr;
}

void ExpectUsableTree(Dispatcher& dispatcher) {
    EXPECT_EQ(dispatcher.GetRootNamespace()->GetNamespaceNodeNames(), Names({"answer", "kelvash"}));
    const auto input = CommandInput::New();
    const auto output = CommandOutput::New();
    input->SetCommandPath({"answer", "get"});
    EXPECT_TRUE(dispatcher.ExecuteCommand(input, output));
    EXPECT_EQ(output->GetRootObject()->ToString(), "42");
}

TEST(PluginLifetime, TheTreeOutlivesAPluginThatFailedHalfWay) {
    {
        Dispatcher dispatcher;
        EXPECT_THROW(dispatcher.AddPlugin(failingPlugin), Zelmar::ZelmarException);
        EXPECT_EQ(dispatcher.GetPluginNames(), Names({"Internal"}));
        ExpectUsableTree(dispatcher);
        dispatcher.ResetRegistrations();
        ExpectUsableTree(dispatcher);
    }
    EXPECT_FALSE(IsLoaded(failingPlugin));
}

TEST(PluginLifetime, TheTreeOutlivesAForgottenPlugin) {
    {
        Dispatcher dispatcher;
        dispatcher.AddPlugin(goodPlugin);
        EXPECT_EQ(dispatcher.GetPluginNames(), Names({"Internal", goodPlugin}));
        dispatcher.ResetRegistrations();
        EXPECT_EQ(dispatcher.GetPluginNames(), Names());
        ExpectUsableTree(dispatcher);
    }
    EXPECT_FALSE(IsLoaded(goodPlugin));
}

TEST(PluginLifetime, AnObjectWithoutTheEntryIsClosedAgain) {
    const std::string path = TEST_PLUGIN_DIR "/no_entry.so";
    Dispatcher dispatcher;
    EXPECT_THROW(dispatcher.AddPlugin(path), Zelmar::ZelmarException);
    EXPECT_FALSE(IsLoaded(path));
}

}  // namespace
}  // namespace AutoCli
