#include <zelmar/autocli/extension/Rethrow.h>
#include <zelmar/autocli/extension/ValueBuilder.h>
#include <zelmar/autocli/extension/XmlOutput.h>

namespace AutoCli {

std::shared_ptr<MetaObj::MetaObject> XmlUtil_ParseXmlOutput(std::string_view text) {
    ValueBuilder builder;
    const bool isWellFormed = WithContext(
        "Error parsing command output.  Unable to build a proper metaobject from output tag.  "
        "output"
        " must contain properly formatted tags of type bool, int, string, structure and list. Error"
        " was : ",
        [&] { return XmlUtil_ReadText(text, "STDOUT", builder); });
    if (isWellFormed && !builder.HasRoot()) {
        throw Zelmar::ZelmarException(
            "Error parsing command output.  Unable to find a properly formatted output tag as the"
            " document root");
    }
    return isWellFormed ? builder.GetValue() : nullptr;
}

}  // namespace AutoCli
