// Nodes of a plugin hold its code: whatever becomes of the plugin, its object must stay loaded for
// as long as the tree, and go with it.

#include <tests/support/Thrown.h>
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

std::string LoadingError(Dispatcher& dispatcher, const std::string& path) {
    return Thrown([&] { dispatcher.AddPlugin(path); });
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
        EXPECT_EQ(LoadingError(dispatcher, failingPlugin),
                  "Error while trying to register the plugin " + failingPlugin +
                      " The question got lost. The functionality in " + failingPlugin +
                      " will not be available until this issue is resolved.");
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
    EXPECT_EQ(LoadingError(dispatcher, path), "Unable to get plugin registration point from " +
                                                  path + " : " + path +
                                                  ": undefined symbol: AutoCli_RegisterNamespaces");
    EXPECT_FALSE(IsLoaded(path));
}

}  // namespace
}  // namespace AutoCli
