#include <zelmar/autocli/extension/Descriptor.h>
#include <zelmar/autocli/extension/Rethrow.h>
#include <zelmar/autocli/extension/ValueBuilder.h>
#include <zelmar/autocli/extension/XmlUtil.h>

using CallSpec::InputSpec;
using CallSpec::OutputSpec;
using Zelmar::ZelmarException;

namespace AutoCli {

void ExtractMetaData(const XmlNode& node, CommandSpec& command) {
    for (const XmlNode& entry : node) {
        if (!XmlUtil_IsTagged(entry)) {
            continue;
        }
        if (entry.name != "meta-data-entry") {
            throw ZelmarException(
                "Found unexpected tag while building meta-data set.  Unexpected tag was: " +
                std::string(entry.name));
        }
        const auto content = XmlUtil_FindContent(entry);
        if (!content) {
            continue;
        }
        const std::string name(XmlUtil_ExtractAttribute(entry, "name"));
        if (name.empty()) {
            throw ZelmarException(
                "Error parsing 'meta-data-entry', missing required attribute 'name'");
        }
        command.AddMetaData(name, std::string(*content));
    }
}

void ExtractFormatParams(const XmlNode& node, CommandSpec& command) {
    bool hasFormatter = false;
    for (const XmlNode& child : node) {
        if (child.name == "formatter") {
            if (hasFormatter) {
                throw ZelmarException("Invalid plugin format.  Duplicate <formatter> tags found");
            }
            hasFormatter = true;
            command.SetDefaultOutputFormatter(std::string(XmlUtil_GetContent(child)));
        } else if (child.name == "format-parameter") {
            command.SetDefaultOutputParameter(std::string(XmlUtil_ExtractAttribute(child, "name")),
                                              std::string(XmlUtil_GetContent(child)));
        }
    }
}

std::shared_ptr<InputSpec> ExtractInputSpec(const XmlNode& node) {
    auto inputSpec = InputSpec::New();
    for (const XmlNode& child : node) {
        if (child.name == "parameter") {
            ExtractInputParam(child, *inputSpec);
        } else if (child.name == "context-supported") {
            inputSpec->SetContextSupported(std::string(XmlUtil_GetContent(child)));
        }
    }
    return inputSpec;
}

std::shared_ptr<OutputSpec> ExtractOutputSpec(const XmlNode& node) {
    auto outputSpec = OutputSpec::New();
    bool hasValue = false;
    for (const XmlNode& child : node) {
        if (!XmlUtil_IsTagged(child)) {
            continue;
        }
        if (hasValue) {
            throw ZelmarException(
                "Found more than one node under 'output-spec', where only one node is supported."
                "  The tag was " +
                std::string(child.name));
        }
        hasValue = true;
        WithContext("Unable to build output spec.  Error was ",
                    [&] { outputSpec->SetRootObject(XmlUtil_BuildMetaObject(child)); });
    }
    return outputSpec;
}

}  // namespace AutoCli
