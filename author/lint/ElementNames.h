#pragma once

#include <author/lint/Xml.h>

namespace Author {

/// What may stand in an element of a descriptor, for suggestions.
struct ElementNames {
    std::vector<std::string> attributes;
    std::vector<std::string> children;
    std::vector<std::string> requiredChildren;
};

/// Those of the element, by its name; none for an unknown one.
const ElementNames& NamesIn(const xmlNode* element);

}  // namespace Author
