#pragma once

#include <zelmar/zelmar.h>

#include <functional>

/// The frame of a program over the tree of the tool: sees to the standard streams, loads what every
/// call has, runs it and exits with the status that it gives. Whatever is thrown is told below
/// "Errors: ", "Unknown error" where it is no standard exception, and gives a failure.
int RunProgram(const std::function<int(AutoCli::CliDispatcher&)>& run);
