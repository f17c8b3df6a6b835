// A text, laid out as the first three bytes tell: indentation, width and the switches.

#include <zelmar/autocli/formatters/FitString.h>

#include <cstdint>
#include <cstdlib>
#include <sstream>
#include <string>

namespace {

std::string WithoutBlanks(std::string text) {
    std::erase_if(text, [](char c) { return c == ' ' || c == '\n'; });
    return text;
}

void Require(bool holds) {
    if (!holds) {
        std::abort();
    }
}

// A line passes the width only with a single word, behind which it may be broken with a blank.
void RequireWithin(const std::string& laidOut, size_t indent, size_t width) {
    std::istringstream lines(laidOut);
    for (std::string line; std::getline(lines, line);) {
        if (line.size() > width) {
            Require(line.find(' ', indent) >= line.size() - 1);
        }
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    if (size < 3) {
        return 0;
    }
    const int indent = data[0] % 32 - 2;
    const int width = data[1] % 64;
    const bool skipFirst = (data[2] & 1) != 0;
    const bool endLine = (data[2] & 2) != 0;
    const bool splitLines = (data[2] & 4) != 0;
    const std::string text(reinterpret_cast<const char*>(data) + 3, size - 3);
    std::ostringstream out;
    AutoCli::AutoCli_FitString(indent, width, text, skipFirst, out, endLine, 0, splitLines);
    Require(WithoutBlanks(out.str()) == WithoutBlanks(text));
    if (splitLines && !skipFirst && indent > 0 && width > indent) {
        RequireWithin(out.str(), static_cast<size_t>(indent), static_cast<size_t>(width));
    }
    return 0;
}
