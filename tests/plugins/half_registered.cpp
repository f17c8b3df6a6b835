// A plugin that fails after it has put a command into the tree.

#include "Answer.h"

extern "C" ZELMAR_EXPORT void AutoCli_RegisterNamespaces(std::shared_ptr<AutoCli::Namespace> root) {
    root->SubNamespace("answer")->RegisterNamespaceNode(std::make_shared<Answer>(), "get");
    throw Zelmar::ZelmarException("The question got lost.");
}
