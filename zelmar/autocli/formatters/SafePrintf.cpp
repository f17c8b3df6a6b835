#include <zelmar/autocli/formatters/SafePrintf.h>
#include <zelmar/internal/Ascii.h>

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cstdio>
#include <cstring>
#include <optional>
#include <string_view>
#include <utility>

namespace {

struct ArgumentKind {
    std::string_view letters;
    std::string_view lengths;  // characters of the length modifiers that are accepted
    std::string_view length;   // the modifier that fits the argument, put in their place
};

constexpr ArgumentKind integer = {"diouxX", "hlLqjzt", "l"};
constexpr ArgumentKind text = {"s", "", ""};

// Writes the format anew, as far as it is accepted, with numbers no greater than they need to be
// for a result of which only the first `limit` bytes are seen. The value's own text is shorter than
// that, so twice the limit of padding still pushes it out of sight.
class FormatReader {
public:
    FormatReader(std::string_view format, const ArgumentKind& kind, size_t limit)
        : _rest(format), _kind(kind), _far(static_cast<long>(2 * limit)) {}

    std::optional<std::string> Read() {
        bool converted = false;
        while (!_rest.empty()) {
            const size_t percent = std::min(_rest.find('%'), _rest.size());
            Keep(percent);
            if (_rest.starts_with("%%")) {
                Keep(2);
            } else if (!_rest.empty()) {
                if (converted || !ReadConversion()) {
                    return std::nullopt;
                }
                converted = true;
            }
        }
        return std::move(_safe);
    }

private:
    bool ReadConversion() {
        Keep(1);
        Keep(std::min(_rest.find_first_not_of("-+ #0'"), _rest.size()));
        long width = 0;
        if (!ReadNumber(width)) {
            return false;
        }
        long precision = 0;
        const bool hasPrecision = _rest.starts_with('.');
        if (hasPrecision) {
            _rest.remove_prefix(1);
            if (!ReadNumber(precision)) {
                return false;
            }
        }
        KeepNumbers(width, hasPrecision, precision);
        return ReadLetter();
    }

    // By how much the width exceeds the precision is what decides the padding, so that is kept.
    void KeepNumbers(long width, bool hasPrecision, long precision) {
        const long shortPrecision = std::min(precision, _far);
        const long shortWidth = width > precision
                                    ? shortPrecision + std::min(width - precision, _far)
                                    : std::min(width, shortPrecision);
        if (shortWidth > 0) {
            _safe += std::to_string(shortWidth);
        }
        if (hasPrecision) {
            _safe += "." + std::to_string(shortPrecision);
        }
    }

    bool ReadLetter() {
        const size_t letter = std::min(_rest.find_first_not_of(_kind.lengths), _rest.size());
        if (!IsLengthModifier(_rest.substr(0, letter)) || letter == _rest.size() ||
            _kind.letters.find(_rest[letter]) == std::string_view::npos) {
            return false;
        }
        _rest.remove_prefix(letter);
        _safe += _kind.length;
        Keep(1);
        return true;
    }

    static bool IsLengthModifier(std::string_view modifier) {
        return modifier.size() <= 1 || modifier == "hh" || modifier == "ll";
    }

    bool ReadNumber(long& number) {
        for (; !_rest.empty() && Ascii::IsDigit(_rest[0]); _rest.remove_prefix(1)) {
            number = number * 10 + (_rest[0] - '0');
            if (number > INT_MAX) {
                errno = EOVERFLOW;
                return false;
            }
        }
        return true;
    }

    void Keep(size_t count) {
        _safe += _rest.substr(0, count);
        _rest.remove_prefix(count);
    }

    std::string_view _rest;
    const ArgumentKind& _kind;
    const long _far;
    std::string _safe;
};

template <class Value>
bool Format(const std::string& format, const ArgumentKind& kind, Value value, size_t limit,
            std::string& result) {
    errno = EINVAL;  // unless the reader knows better
    const auto safe = FormatReader(format.c_str(), kind, limit).Read();
    if (!safe) {
        return false;
    }
    std::string buffer(limit + 1, '\0');
    if (std::snprintf(buffer.data(), buffer.size(), safe->c_str(), value) < 0) {
        return false;
    }
    buffer.resize(std::strlen(buffer.data()));
    result = std::move(buffer);
    return true;
}

}  // namespace

bool FormatSafely(const std::string& format, long value, size_t limit, std::string& result) {
    return Format(format, integer, value, limit, result);
}

bool FormatSafely(const std::string& format, const char* value, size_t limit, std::string& result) {
    return Format(format, text, value, limit, result);
}
