#pragma once

#include <zelmar/zelmar.h>

#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace Author {

/// One call of a command.
struct ProbeCall {
    enum class Environment { Whole, NoLang, Empty };

    std::vector<std::pair<std::string, std::string>> parameters;  ///< names with values
    Environment environment = Environment::Whole;
    bool isIncomplete = false;  ///< a required parameter is missing

    bool operator==(const ProbeCall&) const = default;
};

/// The file that a value makes when a shell runs it.
inline constexpr const char* canary = "canary";

/// The calls that are worth a try: the one that gives the least, help, each parameter with the
/// values at the ends of what its constraint lets through and with hostile ones, a required one
/// missing, and another environment. Nothing when no value was found for a required parameter,
/// which `unknown` gets.
std::optional<std::vector<ProbeCall>> ProbeCallsOf(AutoCli::Command& command, std::string& unknown);

}  // namespace Author
