#pragma once

#include <chrono>
#include <string>
#include <vector>

namespace Author {

struct ProbeOptions {
    std::vector<std::string> plugins;
    std::vector<std::string> environment;  ///< each NAME=VALUE, which an empty one has all the same
    std::chrono::seconds limit{0};         ///< for a call
    bool mayChange = false;  ///< whether to call commands that do not promise to be read-only
};

/// Calls each command of the plugins in many ways, each in a process and an empty folder of its
/// own, and tells on standard output what broke, hung, ran a value as shell text or gave a document
/// of the wrong shape. True when nothing was found. Throws `ZelmarException` for a plugin that does
/// not load, `Unreadable` when a command was left out, and what `RunGuarded` throws.
bool Probe(const ProbeOptions& options);

}  // namespace Author
