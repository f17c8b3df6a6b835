#pragma once

#include <zelmar/Export.h>

#include <functional>
#include <string_view>

namespace MetaObj {
class MetaObject;
}

namespace AutoCli {

/// Writes a value as JSON (RFC 8259) for programs that keep JSON, on one line and without blanks:
/// integers in full, texts and names of fields as UTF-8, in which U+FFFD stands for bytes that are
/// none. Null, and what is of no known kind, is `null`. The text comes in pieces, in order, and
/// what `append` throws passes through. Only memory bounds how deep values are nested.
///
/// The formatter "json" is another form, for readers that expect a character a byte.
ZELMAR_EXPORT void AutoCli_WriteJsonText(const MetaObj::MetaObject* value,
                                         const std::function<void(std::string_view)>& append);

/// Hands on the text with each piece of it that is no UTF-8 replaced by U+FFFD.
ZELMAR_EXPORT void AutoCli_RepairUtf8(std::string_view text,
                                      const std::function<void(std::string_view)>& append);

}  // namespace AutoCli
