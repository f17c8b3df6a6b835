#pragma once

#include <nlohmann/json.hpp>

#include <string>

/// Members keep the order in which they are set, so that messages read well.
using Json = nlohmann::ordered_json;

/// The text of a message on one line; bytes that are no UTF-8 become U+FFFD.
inline std::string TextOf(const Json& message) {
    return message.dump(-1, ' ', false, Json::error_handler_t::replace);
}
