#pragma once

#include <string>

/// A printf format of unknown origin is read before it is used: it may hold one conversion at the
/// most, of a kind that fits the one argument, with flags, a decimal width and a precision, beside
/// plain text and "%%". Nothing is written past `limit` bytes, and no more memory than that is
/// taken, whatever width the format asks for.
///
/// The result is cut at `limit` bytes. False, with the reason in `errno`, when the format is
/// refused (EINVAL; EOVERFLOW for a number beyond an int) or the system's own printf fails.
[[nodiscard]] bool FormatSafely(const std::string& format, long value, size_t limit,
                                std::string& result);
[[nodiscard]] bool FormatSafely(const std::string& format, const char* value, size_t limit,
                                std::string& result);
