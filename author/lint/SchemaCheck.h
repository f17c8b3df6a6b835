#pragma once

#include <author/lint/Report.h>

namespace Author {

/// Holds a descriptor against the schema. What stands in the way of further checks is mended in the
/// document, as its author probably meant it: misspelt names get their right spelling, and what has
/// no place is taken out.
void CheckSchema(xmlDoc* document, Report& report);

}  // namespace Author
