// A shared object that is no plugin.

#include <zelmar/Export.h>

extern "C" ZELMAR_EXPORT int Unrelated() {
    return 42;
}
