#pragma once

#include <zelmar/metaobj/MetaList.h>

#include <memory>
#include <string_view>

struct _xmlNode;  // NOLINT(bugprone-reserved-identifier): the name that libxml2 gives it

// From the dialect of XML that extension commands print to values. The same elements stand in a
// descriptor as the prototype of a command's output. All operations throw `ZelmarException`, with
// texts of their own and those of the value classes.

namespace AutoCli {

/// The value that an element of the dialect stands for:
///
///     <int>7</int>  <bool>true</bool>  <string>text</string>
///     <structure typeName="Item"><field name="id"> value </field> ... </structure>
///     <list type="int|bool|string|structure"> values </list>
[[nodiscard]] std::shared_ptr<MetaObj::MetaObject> XmlUtil_BuildMetaObject(const _xmlNode* node);
[[nodiscard]] std::shared_ptr<MetaObj::MetaList> BuildMetaList(const _xmlNode* node);
/// A field without a value is dropped.
[[nodiscard]] std::shared_ptr<MetaObj::MetaStruct> BuildMetaStruct(const _xmlNode* node);

/// The value in a printed document: the first one below the root element, whatever that is called.
/// Null when there is none and when the text is not well-formed, of which libxml2 tells the details
/// on the error stream.
[[nodiscard]] std::shared_ptr<MetaObj::MetaObject> XmlUtil_ParseXmlOutput(std::string_view text);

}  // namespace AutoCli
