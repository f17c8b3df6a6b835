// A plugin that has nothing to complain of.

#include "Answer.h"

extern "C" ZELMAR_EXPORT void AutoCli_RegisterNamespaces(std::shared_ptr<AutoCli::Namespace> root) {
    root->SubNamespace("answer")->RegisterNamespaceNode(std::make_shared<Answer>(), "get");
}
