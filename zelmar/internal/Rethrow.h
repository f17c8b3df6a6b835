#pragma once

#include <zelmar/ZelmarException.h>

#include <string>

/// The result of `step`. A `ZelmarException` that it throws is thrown anew, with `context` in front
/// of its text.
template <class Step>
auto WithContext(const std::string& context, Step step) {
    try {
        return step();
    } catch (const Zelmar::ZelmarException& error) {
        throw Zelmar::ZelmarException(context + error.what());
    }
}
