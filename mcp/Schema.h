#pragma once

#include <zelmar/zelmar.h>

#include "Json.h"

// JSON Schema (draft 2020-12, the subset that clients of the protocol read) for what a command
// declares.

/// An object with a property for each parameter but `help`. Throws what the declaration throws.
Json InputSchema(AutoCli::Command& command);

/// The shape of what a call gives as structured content, which the protocol wants to be an object:
/// a structure itself, and any other value as the property "result" of one.
Json OutputSchema(AutoCli::Command& command);

/// Does the command's value stand by itself, or as the property "result"?
bool IsObject(const MetaObj::MetaObject* value);

/// A whole-value expression as a `pattern` of ECMA 262, or the empty string when it uses what that
/// does not know. The engine judges every value all the same.
std::string PatternFor(const std::string& expression);
