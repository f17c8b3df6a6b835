#include <author/lint/ElementNames.h>

#include <map>

namespace Author {

const ElementNames& NamesIn(const xmlNode* element) {
    static const std::vector<std::string> values = {"int", "bool", "string", "structure", "list"};
    static const std::map<std::string, ElementNames> names = {
        {"plugin", {{}, {"version", "namespaces", "commands"}, {"version"}}},
        {"namespaces", {{}, {"namespace"}, {}}},
        {"namespace", {{"path"}, {"description"}, {"description"}}},
        {"commands", {{}, {"command"}, {}}},
        {"command",
         {{"path"},
          {"description", "meta-data", "input-spec", "output-spec", "format-parameters", "execute",
           "stdin"},
          {"input-spec", "output-spec", "format-parameters", "execute"}}},
        {"meta-data", {{}, {"meta-data-entry"}, {}}},
        {"meta-data-entry", {{"name"}, {}, {}}},
        {"input-spec", {{}, {"parameter", "context-supported"}, {}}},
        {"parameter",
         {{"name", "type", "required", "secret", "shortname"},
          {"description", "constraint"},
          {"description"}}},
        {"constraint", {{"type"}, {"enum", "regex", "range"}, {}}},
        {"enum", {{}, {"enum-value"}, {"enum-value"}}},
        {"enum-value", {{"value"}, {}, {}}},
        {"range", {{"min", "max"}, {}, {}}},
        {"output-spec", {{}, values, {}}},
        {"structure", {{"typeName"}, {"field"}, {}}},
        {"field", {{"name"}, values, {}}},
        {"list", {{"type"}, {"structure"}, {}}},
        {"format-parameters", {{}, {"formatter", "format-parameter"}, {}}},
        {"format-parameter", {{"name"}, {}, {}}},
    };
    static const ElementNames none;
    const auto found = names.find(NameOf(element));
    return found == names.end() ? none : found->second;
}

}  // namespace Author
