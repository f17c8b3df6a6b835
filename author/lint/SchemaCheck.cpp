#include <author/lint/ElementNames.h>
#include <author/lint/SchemaCheck.h>
#include <author/lint/Suggest.h>
#include <author/schema/Schemas.h>

#include <libxml/xmlschemas.h>

#include <algorithm>
#include <map>
#include <stdexcept>

namespace Author {

namespace {

constexpr int mostMends = 200;

// What libxml2's validator says of one place.
struct Fault {
    xmlNode* node;
    int code;
    std::string text;
};

struct SchemaDeleter {
    void operator()(xmlSchema* schema) const { xmlSchemaFree(schema); }
};
using Schema = std::unique_ptr<xmlSchema, SchemaDeleter>;

Schema ReadSchema() {
    xmlSchemaParserCtxt* context = xmlSchemaNewMemParserCtxt(
        descriptorSchema.data(), static_cast<int>(descriptorSchema.size()));
    Schema schema(xmlSchemaParse(context));
    xmlSchemaFreeParserCtxt(context);
    if (!schema) {
        throw std::runtime_error("Unable to read the schema of descriptors");
    }
    return schema;
}

void Note(void* faults, xmlErrorPtr error) {
    auto* node = static_cast<xmlNode*>(error->node);
    if (node && node->type == XML_ATTRIBUTE_NODE) {
        node = node->parent;
    }
    static_cast<std::vector<Fault>*>(faults)->push_back({node, error->code, ErrorText(*error)});
}

std::vector<Fault> Validate(xmlDoc* document) {
    static const Schema schema = ReadSchema();
    std::vector<Fault> faults;
    xmlSchemaValidCtxt* context = xmlSchemaNewValidCtxt(schema.get());
    xmlSchemaSetValidStructuredErrors(context, Note, &faults);
    xmlSchemaValidateDoc(context, document);
    xmlSchemaFreeValidCtxt(context);
    return faults;
}

// The text between two marks; empty when they are not there.
std::string Between(const std::string& text, std::string_view begin, std::string_view end) {
    const size_t first = text.find(begin);
    const size_t last = first == std::string::npos ? first : text.find(end, first + begin.size());
    return last == std::string::npos
               ? ""
               : text.substr(first + begin.size(), last - first - begin.size());
}

std::vector<std::string> Split(const std::string& text, const std::string& separator) {
    std::vector<std::string> words;
    for (size_t begin = 0; begin < text.size();) {
        const size_t end = std::min(text.find(separator, begin), text.size());
        words.push_back(text.substr(begin, end - begin));
        begin = end + separator.size();
    }
    return words;
}

std::string Tag(const std::string& name) {
    return "<" + name + ">";
}

// The rule behind a pattern of the schema.
std::string RuleFor(const std::string& attribute) {
    static const std::map<std::string, std::string> rules = {
        {"path",
         "names joined by dots; a name is of small letters and digits, and a capital stands alone "
         "behind one of them"},
        {"name", "small letters, digits and dashes, at least two of them, a letter first"},
        {"shortname", "a single letter"},
        {"typeName", "letters and digits"}};
    const auto found = rules.find(attribute);
    return found == rules.end() ? "another text" : found->second;
}

void RemoveNode(xmlNode* node) {
    xmlUnlinkNode(node);
    xmlFreeNode(node);
}

// "This element is not expected."
void MendElement(const Fault& fault, Report& report) {
    const std::string name = NameOf(fault.node);
    const std::string parent = NameOf(fault.node->parent);
    const auto& expected = NamesIn(fault.node->parent).children;
    const bool isTooMany = std::ranges::find(expected, name) != expected.end();
    const std::string nearest = isTooMany ? "" : Nearest(name, expected);
    std::string text;
    if (!nearest.empty()) {
        text = "there is no element " + Tag(name) + " in " + Tag(parent) + "; did you mean " +
               Tag(nearest) + "?";
    } else if (isTooMany) {
        text = "one " + Tag(name) + " too many in " + Tag(parent) + "; leave it out";
    } else {
        text =
            Tag(name) + " has no place in " + Tag(parent) +
            (expected.empty() ? "; leave it out" : ", where " + JoinedByOr(expected) + " stands");
    }
    report.AddError(fault.node, "schema", text);
    if (nearest.empty()) {
        RemoveNode(fault.node);
    } else {
        xmlNodeSetName(fault.node, reinterpret_cast<const xmlChar*>(nearest.c_str()));
    }
}

// "Element 'a', attribute 'b': The attribute 'b' is not allowed."
void MendAttribute(const Fault& fault, Report& report) {
    const std::string element = NameOf(fault.node);
    const std::string name = Between(fault.text, "attribute '", "'");
    const auto& names = NamesIn(fault.node).attributes;
    const std::string nearest = Nearest(name, names);
    const std::string value = Attribute(fault.node, name.c_str());
    report.AddError(fault.node, "schema",
                    Tag(element) + " has no attribute '" + name + "'" +
                        (nearest.empty() ? "" : "; did you mean '" + nearest + "'?"));
    xmlAttr* attribute = xmlHasProp(fault.node, reinterpret_cast<const xmlChar*>(name.c_str()));
    if (attribute) {
        xmlRemoveProp(attribute);
    }
    if (!nearest.empty() && Attribute(fault.node, nearest.c_str()).empty()) {
        xmlSetProp(fault.node, reinterpret_cast<const xmlChar*>(nearest.c_str()),
                   reinterpret_cast<const xmlChar*>(value.c_str()));
    }
}

// "[facet 'enumeration'] The value 'a' is not an element of the set {'b', 'c'}."
std::string WordFault(const std::string& place, const Fault& fault) {
    const std::string value = Between(fault.text, "The value '", "' is not an element");
    const auto words = Split(Between(fault.text, "set {'", "'}"), "', '");
    return place + " is '" + value + "', and can be " + JoinedByOr(words) +
           Suggestion(value, words.size() > 2 ? words : std::vector<std::string>());
}

std::string MissingChildren(const xmlNode* node) {
    std::vector<std::string> missing;
    for (const std::string& name : NamesIn(node).requiredChildren) {
        if (!Child(node, name.c_str())) {
            missing.push_back(Tag(name));
        }
    }
    return Tag(NameOf(node)) +
           (missing.empty() ? " is empty" : " lacks " + JoinedByOr(missing, " and "));
}

std::string TextFor(const Fault& fault) {
    const std::string element = NameOf(fault.node);
    const std::string attribute = Between(fault.text, "attribute '", "'");
    const std::string place =
        attribute.empty() ? Tag(element) : "'" + attribute + "' of " + Tag(element);
    switch (fault.code) {
        case XML_SCHEMAV_CVC_COMPLEX_TYPE_4:
            return Tag(element) + " lacks the attribute '" +
                   Between(fault.text, "The attribute '", "'") + "'";
        case XML_SCHEMAV_ELEMENT_CONTENT:
            return MissingChildren(fault.node);
        case XML_SCHEMAV_CVC_ENUMERATION_VALID:
            return WordFault(place, fault);
        case XML_SCHEMAV_CVC_MINLENGTH_VALID:
            return place + " is empty";
        case XML_SCHEMAV_CVC_PATTERN_VALID:
            return place + " is '" + Attribute(fault.node, attribute.c_str()) + "', and must be " +
                   RuleFor(attribute);
        case XML_SCHEMAV_CVC_DATATYPE_VALID_1_2_1:
        case XML_SCHEMAV_CVC_DATATYPE_VALID_1_2_3:
            return place + " is no whole number of 64 bits";
        case XML_SCHEMAV_CVC_COMPLEX_TYPE_2_3:
            return "text stands in " + Tag(element) + ", which holds elements; it is passed over";
        default:
            return fault.text;
    }
}

bool IsStrayElement(const Fault& fault) {
    return fault.code == XML_SCHEMAV_ELEMENT_CONTENT &&
           fault.text.find("This element is not expected") != std::string::npos;
}

bool IsStray(const Fault& fault) {
    return IsStrayElement(fault) || fault.code == XML_SCHEMAV_CVC_COMPLEX_TYPE_3_2_1;
}

}  // namespace

void CheckSchema(xmlDoc* document, Report& report) {
    std::vector<Fault> faults = Validate(document);
    for (int mends = 0; mends < mostMends; ++mends, faults = Validate(document)) {
        const auto stray = std::ranges::find_if(faults, IsStray);
        if (stray == faults.end()) {
            break;
        }
        IsStrayElement(*stray) ? MendElement(*stray, report) : MendAttribute(*stray, report);
    }
    for (const Fault& fault : faults) {
        if (!IsStray(fault)) {
            report.AddError(fault.node, "schema", TextFor(fault));
        }
    }
}

}  // namespace Author
