#pragma once

#include <zelmar/ZelmarException.h>

#include <string>
#include <string_view>

/// The result of `step`. A `ZelmarException` that it throws is thrown anew, with `context` in front
/// of its text.
template <class Step>
auto WithContext(std::string_view context, Step step) {
    try {
        return step();
    } catch (const Zelmar::ZelmarException& error) {
        throw Zelmar::ZelmarException(std::string(context) + error.what());
    }
}
