#include <author/doc/Pages.h>

#include <algorithm>

namespace Author {

namespace {

// Any punctuation may have a backslash in front; this is what means something within a line, and
// at its start.
std::string Text(const std::string& text) {
    constexpr std::string_view marks = "\\`*_[]<>&|~$!";
    constexpr std::string_view marksAtStart = "#+-=:";
    std::string escaped;
    bool onlyDigits = true;
    for (const char c : OneLine(text)) {
        const bool isMark = marks.find(c) != std::string_view::npos ||
                            (escaped.empty() && marksAtStart.find(c) != std::string_view::npos);
        const bool endsNumber = onlyDigits && !escaped.empty() && (c == '.' || c == ')');
        onlyDigits = onlyDigits && c >= '0' && c <= '9';
        escaped += isMark || endsNumber ? "\\" : "";
        escaped += c;
    }
    return escaped;
}

// Within more backticks than it holds itself.
std::string Code(const std::string& text) {
    const std::string line = OneLine(text);
    if (line.empty()) {
        return "(empty)";
    }
    size_t longest = 0;
    size_t run = 0;
    for (const char c : line) {
        run = c == '`' ? run + 1 : 0;
        longest = std::max(longest, run);
    }
    const std::string fence(longest + 1, '`');
    const std::string pad = line.front() == '`' || line.back() == '`' ? " " : "";
    return fence + pad + line + pad + fence;
}

std::string TextAt(const Json& described, const char* key) {
    return described.contains(key) ? Text(described[key].get<std::string>()) : "";
}

std::string Item(const std::string& head, const Json& described) {
    const std::string text = TextAt(described, "description");
    return "- " + head + (text.empty() ? "" : ": " + text) + "\n";
}

std::string Parameter(const Json& parameter) {
    std::string head = Code("--" + parameter["name"].get<std::string>());
    if (parameter.contains("shortName")) {
        head += ", " + Code("-" + parameter["shortName"].get<std::string>());
    }
    std::string text = Item(head + " (" + KindOf(parameter) + ")", parameter);
    const Json constraint = parameter.value("constraint", Json::object());
    if (constraint.contains("expression")) {
        text += "  - matches " + Code(constraint["expression"].get<std::string>()) + "\n";
    } else if (constraint.contains("minimum")) {
        text += "  - " + RangeOf(constraint) + "\n";
    }
    for (const Json& value : constraint.value("values", Json::array())) {
        text += "  " + Item(Code(ValueOf(value)), value);
    }
    return text;
}

std::string Fields(const Json& shape, const std::string& indent) {
    std::string text;
    for (const Json& field : FieldsOf(shape)) {
        const std::string units = TextAt(field, "units");
        const std::string kind =
            ShapeWords(field["shape"]) + (units.empty() ? "" : ", in " + units);
        text += indent + Item(Code(field["name"].get<std::string>()) + " (" + kind + ")", field);
        text += Fields(field["shape"], indent + "  ");
    }
    return text;
}

std::string Result(const Json& result) {
    const std::string fields = Fields(result["shape"], "");
    const std::string description = TextAt(result, "description");
    return "A value of the kind " + ShapeWords(result["shape"]) +
           (description.empty() ? "." : ": " + description) + "\n" +
           (fields.empty() ? "" : "\n" + fields);
}

std::string Format(const Json& format) {
    const auto formatter = format["formatter"].get<std::string>();
    std::string text = formatter.empty() ? "Nothing is printed unless a formatter is named.\n"
                                         : "Printed by " + Code(formatter) + ".\n";
    text += format["parameters"].empty() ? "" : "\n";
    for (const auto& [key, value] : format["parameters"].items()) {
        text += "- " + Code(key + "=" + value.get<std::string>()) + "\n";
    }
    return text;
}

std::string Section(const std::string& title, const std::string& text) {
    return text.empty() ? "" : "\n**" + title + "**\n\n" + text;
}

std::string Paragraph(const std::string& text) {
    return text.empty() ? "" : "\n" + text + "\n";
}

std::string Command(const Json& command) {
    const std::string path = Joined(command["path"], " ");
    std::string usage = "kelvash " + path;
    std::string parameters;
    for (const Json& parameter : command["parameters"]) {
        usage += " " + UsageOf(parameter);
        parameters += Parameter(parameter);
    }
    std::string examples;
    for (const Json& example : command["examples"]) {
        examples +=
            Item(Code("kelvash " + path + " " + example["arguments"].get<std::string>()), example);
    }
    return "\n### " + path + "\n" + Paragraph(TextAt(command, "description")) + "\n    " + usage +
           "\n" + (command["readOnly"].get<bool>() ? "\nIt changes nothing.\n" : "") +
           Section("Parameters", parameters) + Section("Result", Result(command["result"])) +
           Section("Format", Format(command["format"])) + Section("Examples", examples);
}

Json ParentOf(const Json& command) {
    Json path = command["path"];
    path.erase(path.size() - 1);
    return path;
}

}  // namespace

// Both lists are in the order of the tree: the commands of a namespace follow those of the one
// ahead of it.
std::string AsMarkdown(const Json& reference) {
    std::string page = "# Commands of kelvash\n";
    const Json& namespaces = reference["namespaces"];
    auto node = namespaces.begin();
    const auto addNamespace = [&] {
        page +=
            "\n## " + Joined((*node)["path"], " ") + "\n" + Paragraph(TextAt(*node, "description"));
    };
    Json open = Json::array();
    for (const Json& command : reference["commands"]) {
        const Json parent = ParentOf(command);
        for (; open != parent && node != namespaces.end(); ++node) {
            addNamespace();
            open = (*node)["path"];
        }
        page += Command(command);
    }
    for (; node != namespaces.end(); ++node) {
        addNamespace();
    }
    return page;
}

}  // namespace Author
