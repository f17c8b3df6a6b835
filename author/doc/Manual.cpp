#include <author/doc/Pages.h>

#include <algorithm>
#include <cstdint>
#include <cstdio>

namespace Author {

namespace {

// The code point at the front of valid UTF-8, which is taken away.
uint32_t TakeCodePoint(std::string_view& text) {
    const auto first = static_cast<unsigned char>(text.front());
    const size_t size = first < 0x80 ? 1 : first < 0xe0 ? 2 : first < 0xf0 ? 3 : 4;
    uint32_t point = size == 1 ? first : first & (0x7fu >> size);
    for (const char c : text.substr(1, size - 1)) {
        point = point << 6 | (static_cast<unsigned char>(c) & 0x3f);
    }
    text.remove_prefix(std::min(size, text.size()));
    return point;
}

std::string Character(uint32_t point) {
    switch (point) {
        case '\\':
            return "\\e";
        case '-':
            return "\\-";
        case '\'':
            return "\\(aq";
        case '`':
            return "\\(ga";
        case '^':
            return "\\(ha";
        case '~':
            return "\\(ti";
        default:
            break;
    }
    char number[16];
    std::snprintf(number, sizeof number, "\\[u%04X]", point);
    return point < 0x80 ? std::string(1, static_cast<char>(point)) : number;
}

// Characters as they stand in running text, whatever they mean to troff.
std::string Text(const std::string& text) {
    std::string escaped;
    const std::string line = OneLine(text);
    for (std::string_view rest = line; !rest.empty();) {
        escaped += Character(TakeCodePoint(rest));
    }
    return escaped;
}

std::string TextAt(const Json& described, const char* key) {
    return described.contains(key) ? Text(described[key].get<std::string>()) : "";
}

std::string Bold(const std::string& text) {
    return "\\fB" + Text(text) + "\\fR";
}

// Lines of an ordinary length, none of which is a request.
std::string Filled(const std::string& escaped) {
    constexpr size_t width = 72;
    std::string text;
    size_t column = 0;
    for (std::string_view rest = escaped; !rest.empty();) {
        const std::string_view word = rest.substr(0, rest.find(' '));
        rest.remove_prefix(std::min(word.size() + 1, rest.size()));
        const bool goesOn = column > 0 && column + 1 + word.size() <= width;
        if (!goesOn) {
            text += column > 0 ? "\n" : "";
            text += word.starts_with('.') ? "\\&" : "";
            column = 0;
        }
        text += (goesOn ? " " : "") + std::string(word);
        column += word.size() + (goesOn ? 1 : 0);
    }
    return text.empty() ? "\\&\n" : text + "\n";
}

std::string Item(const std::string& head, const std::string& body) {
    return ".TP\n" + Filled(head) + Filled(body);
}

std::string Indented(const std::string& items) {
    return items.empty() ? "" : ".RS\n" + items + ".RE\n";
}

std::string Option(const Json& parameter) {
    std::string head = Bold("--" + parameter["name"].get<std::string>());
    if (parameter.contains("shortName")) {
        head += ", " + Bold("-" + parameter["shortName"].get<std::string>());
    }
    const std::string text =
        Item(head + " (" + KindOf(parameter) + ")", TextAt(parameter, "description"));
    const Json constraint = parameter.value("constraint", Json::object());
    std::string values;
    for (const Json& value : constraint.value("values", Json::array())) {
        values += Item(Bold(ValueOf(value)), TextAt(value, "description"));
    }
    const std::string rule = constraint.contains("expression")
                                 ? "matches " + TextAt(constraint, "expression")
                             : constraint.contains("minimum") ? Text(RangeOf(constraint))
                                                              : "";
    return text + (rule.empty() ? "" : ".IP\n" + Filled("(" + rule + ")")) + Indented(values);
}

std::string Fields(const Json& shape) {
    std::string text;
    for (const Json& field : FieldsOf(shape)) {
        const std::string units = TextAt(field, "units");
        text += Item(Bold(field["name"].get<std::string>()) + " (" + ShapeWords(field["shape"]) +
                         (units.empty() ? "" : ", in " + units) + ")",
                     TextAt(field, "description"));
        text += Indented(Fields(field["shape"]));
    }
    return text;
}

std::string Result(const Json& result) {
    const std::string description = TextAt(result, "description");
    return Filled("A value of the kind " + ShapeWords(result["shape"]) +
                  (description.empty() ? "." : ": " + description)) +
           Fields(result["shape"]);
}

std::string Format(const Json& format) {
    const auto formatter = format["formatter"].get<std::string>();
    std::string text = Filled(formatter.empty() ? "Nothing is printed unless a formatter is named."
                                                : "Printed by " + Bold(formatter) + ".");
    for (const auto& [key, value] : format["parameters"].items()) {
        text += Item(Bold(key), Text(value.get<std::string>()));
    }
    return text;
}

std::string Section(const char* title, const std::string& text) {
    return text.empty() ? "" : std::string(".SH ") + title + "\n" + text;
}

std::string UpperCase(std::string text) {
    std::ranges::transform(text, text.begin(), [](char c) {
        return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c;
    });
    return text;
}

}  // namespace

std::string ManualName(const Json& command) {
    return "kelvash-" + Joined(command["path"], "-");
}

std::string AsManualPage(const Json& command, const std::string& date) {
    const std::string call = "kelvash " + Joined(command["path"], " ");
    std::string usage = Bold(call);
    std::string options;
    for (const Json& parameter : command["parameters"]) {
        usage += " " + Text(UsageOf(parameter));
        options += Option(parameter);
    }
    std::string examples;
    for (const Json& example : command["examples"]) {
        examples += Item(Bold(call + " " + example["arguments"].get<std::string>()),
                         TextAt(example, "description"));
    }
    std::string description = TextAt(command, "description");
    description = description.empty() ? "A command of kelvash" : description;
    return ".TH " + UpperCase(ManualName(command)) + " 1 " + date + " kelvash\n" +
           Section("NAME", Filled(Text(ManualName(command)) + " \\- " + description)) +
           Section("SYNOPSIS", Filled(usage)) +
           Section("DESCRIPTION",
                   Filled(description +
                          (command["readOnly"].get<bool>() ? ". It changes nothing." : ""))) +
           Section("OPTIONS", options) + Section("RESULT", Result(command["result"])) +
           Section("FORMAT", Format(command["format"])) + Section("EXAMPLES", examples);
}

}  // namespace Author
