#pragma once

#include <zelmar/ZelmarException.h>

#include <string>

/// The text of the exception that the call throws.
template <class Call>
std::string Thrown(Call call) {
    try {
        call();
    } catch (const Zelmar::ZelmarException& error) {
        return error.what();
    }
    return "(nothing was thrown)";
}
