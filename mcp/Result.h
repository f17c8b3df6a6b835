#pragma once

#include <zelmar/zelmar.h>

#include <string>

#include "Json.h"

/// Calls the command with these arguments and gives the `result` of the answer as JSON: the
/// command's value as structured content and the same as text, or all complaints at once with
/// `isError`. A value whose JSON has more than `limit` bytes is a complaint, too.
std::string CallTool(AutoCli::Dispatcher& dispatcher, AutoCli::Command& command,
                     const Json& arguments, size_t limit);

/// The `result` of a call that failed for this reason.
std::string FailedCall(const std::string& reason);

/// The text with each secret among the arguments replaced by "***".
std::string WithoutSecrets(std::string text, AutoCli::Command& command, const Json& arguments);
