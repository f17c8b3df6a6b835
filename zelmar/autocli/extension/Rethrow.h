#pragma once

#include <zelmar/ZelmarException.h>

#include <string>

/// The result of `step`. A `ZelmarException` that it throws is thrown anew, with the text that
/// `context` gives in front of its own.
template <class Context, class Step>
auto WithContext(Context context, Step step) {
    try {
        return step();
    } catch (const Zelmar::ZelmarException& error) {
        throw Zelmar::ZelmarException(std::string(context()) + error.what());
    }
}
