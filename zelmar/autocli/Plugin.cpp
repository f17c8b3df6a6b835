#include <zelmar/autocli/Plugin.h>

namespace AutoCli {

Plugin::~Plugin() = default;

}  // namespace AutoCli
