#pragma once

#include <string_view>

namespace Author {

/// The schema of descriptors, as it is installed.
extern const std::string_view descriptorSchema;
/// The schema of what scripts print.
extern const std::string_view outputSchema;

}  // namespace Author
