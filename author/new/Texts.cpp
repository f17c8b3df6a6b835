#include <author/new/Texts.h>

#include <algorithm>

namespace Author {

namespace {

std::string Namespaces(const NewCommand& command) {
    std::string text;
    std::string path;
    for (size_t i = 0; i + 1 < command.path.size(); ++i) {
        path += (i ? "." : "") + command.path[i];
        text += "    <namespace path=\"" + path + "\"><description>Commands of " + path +
                "</description></namespace>\n";
    }
    return text;
}

std::string Constraint(const NewParameter& parameter) {
    if (!parameter.min.empty()) {
        return "range\"><range min=\"" + parameter.min + "\" max=\"" + parameter.max + "\"/>";
    }
    if (!parameter.values.empty()) {
        std::string text = "stringenum\"><enum>";
        for (const std::string& value : parameter.values) {
            text += "<enum-value value=\"" + value + "\">Say here what it means</enum-value>";
        }
        return text + "</enum>";
    }
    // Everything but what would end the quotes around the value, or be read as a form.
    return parameter.IsList() ? "regex\"><regex>[^{}\"$\\\\`]*</regex>"
                              : "regex\"><regex>[^{}']*</regex>";
}

std::string Parameter(const NewParameter& parameter) {
    std::string text = "        <parameter name=\"" + parameter.name + "\" type=\"" +
                       parameter.type + "\" required=\"" +
                       (parameter.isRequired ? "true" : "false") + "\">\n          <description>" +
                       DescriptionOf(parameter) + "</description>\n";
    if (parameter.ItemType() == "string" || !parameter.min.empty()) {
        text += "          <constraint type=\"" + Constraint(parameter) + "</constraint>\n";
    }
    return text + "        </parameter>\n";
}

std::string Form(const NewParameter& parameter) {
    const std::string option = "--" + parameter.name;
    if (parameter.type == "flag") {
        return " $if{" + parameter.name + "," + option + "}";
    }
    const std::string form = parameter.IsList()
                                 ? "$multilist{" + parameter.name + "," + option + ",true}"
                                 : option + " '$val{" + parameter.name + "}'";
    return parameter.isRequired ? " " + form : " $if{" + parameter.name + "," + form + "}";
}

std::string Sample(const NewResult& result) {
    if (result.fields.empty()) {
        return result.isList ? "<list type=\"" + result.type + "\"/>" : "<" + result.type + "/>";
    }
    std::string text = "<structure typeName=\"" + result.type + "\">";
    for (const NewField& field : result.fields) {
        text += "<field name=\"" + field.name + "\"><" + field.type + "/></field>";
    }
    text += "</structure>";
    return result.isList ? "<list type=\"structure\">" + text + "</list>" : text;
}

std::string Formats(const NewResult& result) {
    if (result.fields.empty()) {
        return "        <formatter>simple</formatter>\n";
    }
    std::string fields;
    for (const NewField& field : result.fields) {
        fields += (fields.empty() ? "" : ",") + field.name;
    }
    return std::string("        <formatter>") + (result.isList ? "table" : "simple") +
           "</formatter>\n        <format-parameter name=\"fields:" + result.type + "\">" + fields +
           "</format-parameter>\n";
}

}  // namespace

std::string DescriptionOf(const NewParameter& parameter) {
    return "Say here what --" + parameter.name + " is for" +
           (!parameter.values.empty() ? ", %FULLENUM%"
            : !parameter.min.empty()  ? ", %REGEX%"
                                      : "");
}

std::string DescriptorOf(const NewCommand& command) {
    std::string parameters;
    std::string line = (command.language == "perl" ? "PERL_BADLANG=0 " : "") + command.script;
    for (const NewParameter& parameter : command.parameters) {
        parameters += Parameter(parameter);
        line += Form(parameter);
    }
    return R"(<?xml version="1.0" encoding="UTF-8"?>
<plugin xmlns:xsi="http://www.w3.org/2001/XMLSchema-instance"
        xsi:noNamespaceSchemaLocation="/usr/share/zelmar/descriptor.xsd">
  <version>1.0.0</version>
  <namespaces>
)" + Namespaces(command) +
           R"(  </namespaces>
  <commands>
    <command path=")" +
           command.Path(".") + R"(">
      <description>)" +
           commandDescription + R"(</description>
      <!-- What the command takes: the options that users give. -->
      <input-spec>
)" + parameters +
           R"(      </input-spec>
      <!-- What the script prints: a sample, of which the shape counts and not the values. -->
      <output-spec>)" +
           Sample(command.result) + R"(</output-spec>
      <!-- How it is shown when the user does not say. -->
      <format-parameters>
)" + Formats(command.result) +
           R"(      </format-parameters>
      <!-- The shell line. $if{NAME,TEXT} is there when the option was given, $val{NAME} is its
           value; the quotes around it protect it, and the constraint keeps out what ends them. -->
      <execute>)" +
           line + R"(</execute>
    </command>
  </commands>
</plugin>
)";
}

std::string PageOf(const NewCommand& command) {
    const std::string call =
        "$ kelvash --plugin \"$PAGES/" + command.Path("-") + ".xml\" " + command.Path(" ");
    std::string options;
    for (const NewParameter& parameter : command.parameters) {
        if (parameter.isRequired) {
            options += " --" + parameter.name +
                       (parameter.type == "flag" ? "" : " " + parameter.Example());
        }
    }
    return "# " + command.Path(" ") + "\n\nRun by `zelmar test " + command.Path("-") +
           ".md`; `--update` writes down what the commands print.\n\n```console\n" + call +
           options + "\n" + call + " --help\n```\n";
}

}  // namespace Author
