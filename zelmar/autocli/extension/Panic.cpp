#include <zelmar/autocli/extension/Panic.h>

#include <cstdarg>
#include <cstdio>
#include <cstdlib>

// Static, as a process that panics may have run out of stack.
static char panicText[256];

void Panic(const char* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    std::vsnprintf(panicText, sizeof panicText, format, arguments);
    va_end(arguments);
    std::fprintf(stderr, "panic: %s", panicText);
    std::abort();
}
