#pragma once

#include <zelmar/zelmar.h>

/// Loads the plugins that every call of the tool has: those of the default folders, if there are
/// any, then those of the folders that KELVASH_PLUGIN_PATH names, with colons in between. Takes the
/// default formatter from KELVASH_FORMATTER. In a process that has more rights than its caller both
/// variables count for nothing.
void SetUpFromEnvironment(AutoCli::CliDispatcher& dispatcher);
