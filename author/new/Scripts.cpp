#include <author/new/Texts.h>

#include <algorithm>
#include <regex>
#include <stdexcept>

namespace Author {

namespace {

std::string Underscored(std::string name) {
    std::ranges::replace(name, '-', '_');
    return name;
}

std::string ExampleOf(const std::string& type, const char* truth) {
    return type == "int" ? "1" : type == "bool" ? truth : "\"example\"";
}

// The beginning of the functions of the helper.
std::string AwkName(const std::string& type) {
    return type == "int" ? "number" : type == "bool" ? "truth" : "text";
}

std::string AwkItem(const NewResult& result) {
    if (result.fields.empty()) {
        return "    " + AwkName(result.type) + "_item(" + ExampleOf(result.type, "1") + ")\n";
    }
    std::string text = "    open_structure(\"" + result.type + "\")\n";
    for (const NewField& field : result.fields) {
        text += "    " + AwkName(field.type) + "_field(\"" + field.name + "\", " +
                ExampleOf(field.type, "1") + ")\n";
    }
    return text + "    end()\n";
}

// One line of the loop over the options.
std::string ShCase(const NewParameter& parameter) {
    const std::string name = Underscored(parameter.name);
    const std::string head = "    --" + parameter.name + ") " + name + "=";
    return head + (parameter.type == "flag" ? "yes; shift ;;\n"
                   : parameter.IsList()
                       ? "\"${" + name + ":+$" + name + "$line_feed}$2\"; shift 2 ;;\n"
                       : "$2; shift 2 ;;\n");
}

std::string PythonType(const std::string& type) {
    return type == "string" ? "str" : type == "flag" ? "bool" : type;
}

// Words that cannot be names.
void CheckPythonName(const std::string& name) {
    static const std::regex keywords(
        "None|True|False|and|as|assert|async|await|break|class|continue|def|del|elif|else|except|"
        "finally|for|from|global|if|import|in|is|lambda|nonlocal|not|or|pass|raise|return|try|"
        "while|with|yield");
    if (std::regex_match(name, keywords)) {
        throw std::invalid_argument("'" + name + "' means something else in Python; take another");
    }
}

std::string PythonParameter(const NewParameter& parameter) {
    const std::string item = PythonType(parameter.ItemType());
    std::string type = parameter.IsList() ? "list[" + item + "]" : item;
    const bool isOptional = !parameter.isRequired && parameter.type != "flag";
    type = isOptional ? "Optional[" + type + "]" : type;
    std::string extra;
    if (!parameter.min.empty()) {
        extra = ", range=(" + parameter.min + ", " + parameter.max + ")";
    }
    for (const std::string& value : parameter.values) {
        extra +=
            (extra.empty() ? ", values={\"" : ", \"") + value + "\": \"Say here what it means\"";
    }
    extra += parameter.values.empty() ? "" : "}";
    return "    " + Underscored(parameter.name) + ": Annotated[\n        " + type +
           ", Parameter(\"" + DescriptionOf(parameter) + "\"" + extra + ")\n    ]" +
           (isOptional                 ? " = None,\n"
            : parameter.type == "flag" ? " = False,\n"
                                       : ",\n");
}

std::string PerlParameter(const NewParameter& parameter) {
    std::string text = "        '" + parameter.name + "' => { type => '" + parameter.type + "', " +
                       (parameter.isRequired ? "required => 1, " : "");
    if (!parameter.min.empty()) {
        text += "range => [" + parameter.min + ", " + parameter.max + "], ";
    }
    for (const std::string& value : parameter.values) {
        text += (value == parameter.values.front() ? "values => ['" : ", '") + value +
                "' => 'Say here what it means'";
    }
    text += parameter.values.empty() ? "" : "], ";
    return text + "\n            description => '" + DescriptionOf(parameter) + "' },\n";
}

std::string DescriptorHint(const NewCommand& command) {
    const std::string name = command.Path("-");
    return "# The descriptor is " + name +
           ".xml. When what is declared here changes, write it anew:\n#     ./" + name +
           " --descriptor >" + name + ".xml\n";
}

}  // namespace

std::string ShScriptOf(const NewCommand& command) {
    std::string variables;
    std::string cases;
    bool hasLists = false;
    for (const NewParameter& parameter : command.parameters) {
        variables += (variables.empty() ? "" : " ") + Underscored(parameter.name) + "=''";
        cases += ShCase(parameter);
        hasLists |= parameter.IsList();
    }
    const NewResult& result = command.result;
    const std::string list =
        "    open_list(\"" + (result.fields.empty() ? result.type : "structure") + "\")\n";
    return "#!/bin/sh\n# The command " + command.Path(" ") + ".\n" +
           ". \"$(dirname \"$0\")/dialect.sh\"\n\n" +
           (hasLists ? "line_feed='\n' # between the values of an option that is repeated\n" : "") +
           (variables.empty() ? "" : variables + "\n") +
           "while [ $# -gt 0 ]; do\n    case $1 in\n" + cases +
           "    *) fail \"Unknown option: $1\" ;;\n    esac\ndone\n\n"
           "# An example. To print a row for each line of a program, write\n"
           "#     rows PROGRAM | dialect 'BEGIN { open_list(...) } { ... $1 ... } END { end() }' "
           "-\n"
           "# The head of dialect.sh tells more.\ndialect 'BEGIN {\n" +
           (result.isList ? list : "") + AwkItem(result) + (result.isList ? "    end()\n" : "") +
           "}'\n";
}

std::string PythonScriptOf(const NewCommand& command) {
    const NewResult& result = command.result;
    std::string type = PythonType(result.type);
    std::string value = ExampleOf(result.type, "True");
    std::string declaration;
    if (!result.fields.empty()) {
        declaration = "@dataclass\nclass " + type + ":\n";
        value = type + "(";
        for (const NewField& field : result.fields) {
            CheckPythonName(field.name);
            declaration += "    " + field.name + ": " + PythonType(field.type) + "\n";
            value += (value.ends_with("(") ? "" : ", ") + field.name + "=" +
                     ExampleOf(field.type, "True");
        }
        declaration += "\n\n";
        value += ")";
    }
    if (result.isList) {
        type = "list[" + type + "]";
        value = "[" + value + "]";
    }
    std::string parameters;
    for (const NewParameter& parameter : command.parameters) {
        CheckPythonName(parameter.name);
        parameters += PythonParameter(parameter);
    }
    return "#!/usr/bin/python3 -B\n" + DescriptorHint(command) +
           "from dataclasses import dataclass\nfrom typing import Annotated, Optional\n\n"
           "import kelvash\nfrom kelvash import Parameter\n\n\n" +
           declaration + "def command(" + (parameters.empty() ? "" : "\n    *,\n" + parameters) +
           ") -> " + type + ":\n    \"\"\"" + commandDescription + "\"\"\"\n    return " + value +
           "  # an example\n\n\nkelvash.run(\"" + command.Path(".") + "\", command)\n";
}

std::string PerlScriptOf(const NewCommand& command) {
    const NewResult& result = command.result;
    std::string type = "'" + result.type + "'";
    std::string value = ExampleOf(result.type, "1");
    if (!result.fields.empty()) {
        std::string fields;
        value = "{ ";
        for (const NewField& field : result.fields) {
            const std::string separator = fields.empty() ? "" : ", ";
            fields += separator + field.name + " => '" + field.type + "'";
            value += separator + field.name + " => " + ExampleOf(field.type, "1");
        }
        type = "structure(" + result.type + " => [" + fields + "])";
        value += " }";
    }
    if (result.isList) {
        type = "list(" + type + ")";
        value = "[" + value + "]";
    }
    std::string parameters;
    for (const NewParameter& parameter : command.parameters) {
        parameters += PerlParameter(parameter);
    }
    return "#!/usr/bin/perl\n" + DescriptorHint(command) +
           "use strict;\nuse warnings;\nuse File::Basename;\nuse lib dirname(__FILE__);\n"
           "use Kelvash;\n\nrun(\n    path => '" +
           command.Path(".") + "',\n    description => '" + commandDescription +
           "',\n    parameters => [\n" + parameters + "    ],\n    result => " + type +
           ",\n    code => sub {\n        my %option = @_;\n        return " + value +
           ";    # an example\n    },\n);\n";
}

}  // namespace Author
