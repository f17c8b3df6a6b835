#pragma once

/// Stand-ins for the platform's text routines. `length` is in bytes, with -1 for a text that ends
/// at its zero byte; `encoding` is 0 for UTF-8, the only one there is.

/// Strict UTF-8: no overlong forms, no surrogates, nothing above U+10FFFF.
[[nodiscard]] bool Textrun_IsBufferValid(const char* text, int length, int encoding);

/// A copy in which every valid sequence stands as it is and each byte of an invalid one is the four
/// characters `\xHH` with lower-case digits. The caller releases it with `free`. Throws
/// `std::bad_alloc`.
[[nodiscard]] char* Textrun_EscapeBuffer(const char* text, int length, int encoding);
