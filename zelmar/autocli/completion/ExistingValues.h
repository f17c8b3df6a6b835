#pragma once

#include <string>
#include <vector>

namespace AutoCli {

class Dispatcher;

/// The values that exist, as a command tells them: `source` is its path and a field of what it
/// gives, "account user list:Name". The command runs in a process of its own, which sees no
/// terminal and no error stream; after half a second or a megabyte of values it is ended with all
/// that it started. Empty when it fails, is late, needs a parameter, or there is no such command or
/// field.
std::vector<std::string> ExistingValues(Dispatcher& dispatcher, const std::string& source);

}  // namespace AutoCli
