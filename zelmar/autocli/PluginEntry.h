#pragma once

#include <zelmar/Export.h>
#include <zelmar/autocli/Namespace.h>

#include <memory>

/// What a shared-object plugin defines, and the engine calls once: it adds its nodes below the root
/// of the tree. Declared here so that a definition of another form does not compile.
///
///     extern "C" void AutoCli_RegisterNamespaces(std::shared_ptr<AutoCli::Namespace> root) { ... }
///
/// It may throw. Then the plugin is left out and named in a complaint with the text of a standard
/// exception, or "Unknown error"; the nodes that it has added by then stay.
extern "C" ZELMAR_EXPORT void AutoCli_RegisterNamespaces(std::shared_ptr<AutoCli::Namespace> root);
