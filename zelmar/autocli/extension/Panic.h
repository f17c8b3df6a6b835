#pragma once

#include <zelmar/Export.h>

/// Writes "panic: " and the formatted text, cut at 255 characters, to the standard error stream,
/// without a line feed, and aborts the process. For hosts: nothing in the library calls it.
extern "C" [[noreturn]] ZELMAR_EXPORT void Panic(const char* format, ...)
    __attribute__((format(printf, 1, 2)));
