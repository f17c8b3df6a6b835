#pragma once

#include <cstddef>

/// Stand-ins for the platform's process routines. What is unnamed is fixed: the platform gives
/// other values a meaning that nothing here needs.

/// Starts a program with `arguments`, the program's name first, in `environment`, or in that of the
/// caller when it is null; both end with a null pointer. `descriptors` become 0, 1, 2 and so on of
/// the child; one that is already below `count` has to stand at its own place, and is left alone
/// there when it is closed. The child starts with the caller's signal mask, and with `SIGPIPE` at
/// its default even where the caller ignores it. Returns 0 and the child in `processId`, for the
/// caller to wait for, or the status of the failure.
[[nodiscard]] int DrnuserCompat_ForkExec(const char* program, char* const* arguments,
                                         char* const* environment, int, const int* descriptors,
                                         int count, int, int, int, int* processId);

/// Writes the text for a status other than 0, cut to fit, and ends it with a zero byte.
void DrnuserStatus_CodeToString(int status, char* buffer, size_t size, int);
