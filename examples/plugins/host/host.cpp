#include "InfoGet.h"
#include "MountList.h"
#include "ProcessList.h"

#include <zelmar/zelmar.h>

namespace {

void AddCommand(AutoCli::NamespaceNode& host, const char* object, const char* description,
                const char* verb, std::shared_ptr<AutoCli::Command> command) {
    const auto node = host.SubNamespace(object);
    node->SetDescription(description);
    node->RegisterNamespaceNode(std::move(command), verb);
}

}  // namespace

/// What the engine calls once it has loaded this object. It may throw; what is in the tree by then
/// stays there.
extern "C" void AutoCli_RegisterNamespaces(std::shared_ptr<AutoCli::Namespace> root) {
    const auto host = root->SubNamespace("host");
    host->SetDescription("This machine as its kernel sees it");
    AddCommand(*host, "info", "The machine itself", "get", Host::InfoGet::New());
    AddCommand(*host, "mount", "Mounted file systems", "list", Host::MountList::New());
    AddCommand(*host, "process", "Running programs", "list", Host::ProcessList::New());
}
