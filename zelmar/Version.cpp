#include <zelmar/Version.h>

namespace Zelmar {

const char* GetVersion() {
    return ZELMAR_VERSION;
}

}  // namespace Zelmar
