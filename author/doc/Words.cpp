#include <author/doc/Reference.h>

namespace Author {

std::string Joined(const Json& words, const std::string& between) {
    std::string text;
    for (const Json& word : words) {
        text += (text.empty() ? "" : between) + word.get<std::string>();
    }
    return text;
}

std::string KindOf(const Json& parameter) {
    std::string text = parameter["kind"].get<std::string>();
    for (const char* property : {"required", "repeated", "secret"}) {
        text += parameter[property].get<bool>() ? std::string(", ") + property : "";
    }
    return text;
}

std::string UsageOf(const Json& parameter) {
    std::string text = "--" + parameter["name"].get<std::string>();
    if (const auto kind = parameter["kind"].get<std::string>(); kind != "flag") {
        text += kind == "string" ? " STRING" : kind == "int" ? " INT" : " BOOL";
    }
    text = parameter["required"].get<bool>() ? text : "[" + text + "]";
    return text + (parameter["repeated"].get<bool>() ? "..." : "");
}

std::string RangeOf(const Json& constraint) {
    return "from " + constraint["minimum"].dump() + " to " + constraint["maximum"].dump();
}

std::string ValueOf(const Json& value) {
    const Json& typed = value["value"];
    return typed.is_string() ? typed.get<std::string>() : typed.dump();
}

std::string ShapeWords(const Json& shape) {
    const auto kind = shape["kind"].get<std::string>();
    return kind == "structure" ? "structure " + shape["type"].get<std::string>()
           : kind == "list"    ? "list of " + ShapeWords(shape["items"])
                               : kind;
}

const Json& FieldsOf(const Json& shape) {
    static const Json none = Json::array();
    return shape.contains("items")    ? FieldsOf(shape["items"])
           : shape.contains("fields") ? shape["fields"]
                                      : none;
}

std::string OneLine(const std::string& text) {
    std::string line;
    for (const char c : text) {
        const bool isBlank = static_cast<unsigned char>(c) <= ' ' || c == 0x7f;
        if (!isBlank) {
            line += c;
        } else if (!line.empty() && line.back() != ' ') {
            line += ' ';
        }
    }
    line.erase(line.find_last_not_of(' ') + 1);
    return line;
}

}  // namespace Author
