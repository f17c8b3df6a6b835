#pragma once

#include <charconv>
#include <optional>
#include <string_view>

/// The number at the front of a text, read as `std::istream` reads one in the classic locale: white
/// space and a sign may stand before the digits, and anything may follow them. None when there are
/// no digits or the number does not fit.
[[nodiscard]] inline std::optional<long> ReadStreamInt(std::string_view text) {
    const size_t start = text.find_first_not_of(" \t\n\v\f\r");
    if (start == std::string_view::npos) {
        return std::nullopt;
    }
    text.remove_prefix(start);
    if (text.starts_with('+') && !text.starts_with("+-")) {
        text.remove_prefix(1);
    }
    long number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    return error == std::errc() ? std::optional(number) : std::nullopt;
}
