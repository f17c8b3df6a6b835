#pragma once

#include <string>

namespace AutoCli {

/// Erases the conditions whose parameter was not given: each pair of braces that, together with
/// what stands before it from the nearest `$` on, holds anything like a condition goes with that
/// text. Time is linear in the text.
void RemoveLeftoverConditions(std::string& text);

}  // namespace AutoCli
