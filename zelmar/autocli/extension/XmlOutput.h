#pragma once

#include <zelmar/Export.h>
#include <zelmar/metaobj/MetaObject.h>

#include <memory>
#include <string_view>

namespace AutoCli {

/// The value in a document as extension commands print it: the first one below the root element,
/// whatever that is called.
///
///     <int>7</int>  <bool>true</bool>  <string>text</string>
///     <structure typeName="Item"><field name="id"> value </field> ... </structure>
///     <list type="int|bool|string|structure"> values </list>
///
/// These are not the elements that the formatter "xml" writes. Null when there is no value, and
/// when the text is not well-formed, of which libxml2 tells the details on the error stream. The
/// text is not kept, and is never in memory a second time. May be called from several threads.
///
/// Throws `ZelmarException`: "Error parsing command output.  Unable to build a proper metaobject
/// from output tag.  output must contain properly formatted tags of type bool, int, string,
/// structure and list. Error was : <what is wrong>".
ZELMAR_EXPORT std::shared_ptr<MetaObj::MetaObject> XmlUtil_ParseXmlOutput(std::string_view text);

}  // namespace AutoCli
