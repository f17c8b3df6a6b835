#pragma once

#include <zelmar/Export.h>

/// The version of the headers that a program is compiled with, by the rules of semver.org: what is
/// compiled with one minor version works with each later one of the same major version.
#define ZELMAR_VERSION_MAJOR 1
#define ZELMAR_VERSION_MINOR 0
#define ZELMAR_VERSION_PATCH 0
#define ZELMAR_VERSION "1.0.0"

namespace Zelmar {

/// The version of the library that the program runs with, such as "1.0.0".
ZELMAR_EXPORT const char* GetVersion();

}  // namespace Zelmar
