#include <zelmar/autocli/extension/Descriptor.h>
#include <zelmar/autocli/extension/Rethrow.h>
#include <zelmar/autocli/extension/XmlOutput.h>

using CallSpec::InputSpec;
using CallSpec::OutputSpec;
using Zelmar::ZelmarException;

namespace AutoCli {

void ExtractMetaData(const xmlNode* node, CommandSpec& command) {
    XmlUtil_ForEachChild(node, [&command](const xmlNode* entry) {
        const std::string_view tag = XmlUtil_GetName(entry);
        if (!XmlUtil_IsTagged(entry)) {
            return;
        }
        if (tag != "meta-data-entry") {
            throw ZelmarException(
                "Found unexpected tag while building meta-data set.  Unexpected tag was: " +
                std::string(tag));
        }
        bool hasContent = false;
        XmlUtil_ForEachChild(
            entry, [&](const xmlNode* child) { hasContent = hasContent || child->content; });
        if (!hasContent) {
            return;
        }
        const std::string name = XmlUtil_ExtractAttribute(entry, "name");
        if (name.empty()) {
            throw ZelmarException(
                "Error parsing 'meta-data-entry', missing required attribute 'name'");
        }
        command.AddMetaData(name, XmlUtil_GetContent(entry));
    });
}

void ExtractFormatParams(const xmlNode* node, CommandSpec& command) {
    bool hasFormatter = false;
    XmlUtil_ForEachChild(node, [&](const xmlNode* child) {
        const std::string_view tag = XmlUtil_GetName(child);
        if (tag == "formatter") {
            if (hasFormatter) {
                throw ZelmarException("Invalid plugin format.  Duplicate <formatter> tags found");
            }
            hasFormatter = true;
            command.SetDefaultOutputFormatter(XmlUtil_GetContent(child));
        } else if (tag == "format-parameter") {
            command.SetDefaultOutputParameter(XmlUtil_ExtractAttribute(child, "name"),
                                              XmlUtil_GetContent(child));
        }
    });
}

std::shared_ptr<InputSpec> ExtractInputSpec(const xmlNode* node) {
    auto inputSpec = InputSpec::New();
    XmlUtil_ForEachChild(node, [&inputSpec](const xmlNode* child) {
        const std::string_view tag = XmlUtil_GetName(child);
        if (tag == "parameter") {
            ExtractInputParam(child, *inputSpec);
        } else if (tag == "context-supported") {
            inputSpec->SetContextSupported(XmlUtil_GetContent(child));
        }
    });
    return inputSpec;
}

std::shared_ptr<OutputSpec> ExtractOutputSpec(const xmlNode* node) {
    auto outputSpec = OutputSpec::New();
    bool hasValue = false;
    XmlUtil_ForEachChild(node, [&](const xmlNode* child) {
        if (!XmlUtil_IsTagged(child)) {
            return;
        }
        if (hasValue) {
            throw ZelmarException(
                "Found more than one node under 'output-spec', where only one node is supported."
                "  The tag was " +
                std::string(XmlUtil_GetName(child)));
        }
        hasValue = true;
        WithContext([] { return "Unable to build output spec.  Error was "; },
                    [&] { outputSpec->SetRootObject(XmlUtil_BuildMetaObject(child)); });
    });
    return outputSpec;
}

}  // namespace AutoCli
