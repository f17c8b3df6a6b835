#include <author/try/ShapeJudge.h>

#include <algorithm>
#include <array>
#include <charconv>

using MetaObj::MetaCast;

namespace Author {

namespace {

constexpr std::string_view blanks = " \t\n\r";

bool IsWholeNumber(std::string_view text) {
    const size_t start = text.find_first_not_of(blanks);
    if (start == std::string_view::npos) {
        return false;
    }
    text = text.substr(start, text.find_last_not_of(blanks) - start + 1);
    text.remove_prefix(text.starts_with('+') && !text.starts_with("+-") ? 1 : 0);
    long number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    return error == std::errc() && end == text.data() + text.size();
}

bool IsTruth(const std::string& text) {
    constexpr std::array<std::string_view, 6> words = {"true", "false", "t", "f", "1", "0"};
    return std::ranges::find(words, text) != words.end();
}

std::string Escaped(const std::string& text) {
    std::string escaped;
    for (const char c : text) {
        if (c == '&' || c == '<' || c == '>' || c == '\r') {
            escaped += "&#" + std::to_string(c) + ";";
        } else {
            // A document that is not well-formed may have others, which this one must not.
            escaped +=
                static_cast<unsigned char>(c) < ' ' && blanks.find(c) == blanks.npos ? '?' : c;
        }
    }
    return escaped;
}

// What the engine makes of it, in its own words; empty when it refuses it.
std::string ReadingOf(std::string_view name, const std::string& content) {
    const std::string element(name);
    try {
        const auto value = AutoCli::XmlUtil_ParseXmlOutput(
            "<output><" + element + ">" + Escaped(content) + "</" + element + "></output>");
        return !value                                                 ? ""
               : name == "int"                                        ? value->ToString()
               : MetaCast<MetaObj::MetaBool>(value.get())->GetValue() ? "true"
                                                                      : "false";
    } catch (const Zelmar::ZelmarException&) {
        return "";
    }
}

}  // namespace

std::string Quoted(std::string_view text) {
    constexpr size_t longest = 60;
    std::string quoted = "'";
    for (const char c : text.substr(0, longest)) {
        quoted += static_cast<unsigned char>(c) < ' ' ? ' ' : c;
    }
    return quoted + (text.size() > longest ? "...'" : "'");
}

std::string ScalarFault(std::string_view name, const std::string& content) {
    if (name == "int" && !IsWholeNumber(content)) {
        const std::string reading = ReadingOf(name, content);
        return content.empty() ? "an empty <int> is read as 0; write the number"
               : reading.empty()
                   ? Quoted(content) + " is no whole number of 64 bits, and the document is refused"
                   : Quoted(content) + " is no whole number and is read as " + reading;
    }
    if (name == "bool" && !IsTruth(content)) {
        return Quoted(content) + " is read as " + ReadingOf(name, content) +
               "; write true or false";
    }
    return "";
}

}  // namespace Author
