#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/formatters/CommandHelpFormatter.h>
#include <zelmar/autocli/formatters/FitString.h>
#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <algorithm>
#include <ostream>

using MetaObj::MetaBool;
using MetaObj::MetaCast;
using MetaObj::MetaList;
using MetaObj::MetaString;
using MetaObj::MetaStruct;
using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

constexpr const char* secretWarning =
    "\nWARNING: Providing secret values on the command line is insecure because it may be logged or"
    " preserved in history files. Instead, specify this option with no value on the command line,"
    " and enter the value on the supplied prompt.";

std::shared_ptr<MetaStruct> AsStruct(const std::shared_ptr<MetaObj::MetaObject>& value) {
    return std::dynamic_pointer_cast<MetaStruct>(value);
}

bool IsSet(const MetaStruct& structure, const std::string& name) {
    const auto field = structure.GetField(name);
    const auto* truth = MetaCast<MetaBool>(field.get());
    return truth && truth->GetValue();
}

std::string TaggedDescription(const std::shared_ptr<MetaStruct>& parameter) {
    const bool isSecret = IsSet(*parameter, "Secret");
    std::string tags = IsSet(*parameter, "Required") ? "required" : "";
    if (isSecret) {
        tags += tags.empty() ? "secret" : " secret";
    }
    std::string text = GetStringField(parameter, "Description");
    if (!tags.empty()) {
        text += " (" + tags + ")";
    }
    return isSecret ? text + secretWarning : text;
}

void WriteParameter(const std::shared_ptr<MetaStruct>& parameter, size_t column, int width,
                    std::ostream& out) {
    const std::string name = GetStringField(parameter, "Name");
    const std::string shortName = GetStringField(parameter, "Short Name");
    const std::string description = TaggedDescription(parameter);
    out << (shortName.empty() ? "     --" : "  -" + shortName + "|--") << name
        << std::string(column + 2 - name.size(), ' ');
    if (description.empty()) {
        out << std::endl;
    } else {
        AutoCli_FitString(static_cast<int>(column) + 9, width, description, true, out, true, 0,
                          true);
    }
}

void WriteParameters(const MetaList& list, int width, std::ostream& out) {
    size_t column = 0;
    for (const auto& item : list.GetObjects()) {
        if (const auto parameter = AsStruct(item)) {
            column = std::max(column, GetStringField(parameter, "Name").size() + 1);
        }
    }
    for (const auto& item : list.GetObjects()) {
        if (const auto parameter = AsStruct(item)) {
            WriteParameter(parameter, column, width, out);
        }
    }
}

void WriteExamples(const MetaList& list, int width, std::ostream& out) {
    out << std::endl << "Examples: " << std::endl << std::endl;
    for (const auto& item : list.GetObjects()) {
        const auto example = AsStruct(item);
        AutoCli_FitString(4, width, GetStringField(example, "Description"), false, out, true, 0,
                          false);
        out << GetStringField(example, "Syntax");
        AutoCli_FitString(8, width, "", false, out, true, 0, false);
        out << std::endl;
    }
}

}  // namespace

std::string GetStringField(std::shared_ptr<MetaStruct> structure, const std::string& name) {
    const auto field = structure ? structure->GetField(name) : nullptr;
    const auto* text = MetaCast<MetaString>(field.get());
    return text ? text->GetValue() : "";
}

CommandHelpFormatter::CommandHelpFormatter() : Formatter("commandhelp") {
    _description = "Handle --help output for commands";
}

CommandHelpFormatter::~CommandHelpFormatter() = default;

bool CommandHelpFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                                  FormatParameters& /*parameters*/, DisplayContext& context,
                                  std::ostream& stream) {
    const auto help = AsStruct(output->GetRootObject());
    if (!help || help->GetTypeName() != "KelVashCommandHelp") {
        throw ZelmarException(
            "Error: Unexpected type for output, formatter expected a struct with help information");
    }
    const int width = context.screenWidth;
    stream << "Usage: " << GetStringField(help, "Dispatcher") << " " << GetStringField(help, "Path")
           << " <options>" << std::endl
           << std::endl;
    stream << "Description: " << GetStringField(help, "Description") << std::endl << std::endl;
    const auto parameters = help->GetField("Param List");
    if (const auto* list = MetaCast<MetaList>(parameters.get())) {
        WriteParameters(*list, width, stream);
    }
    const auto examples = help->GetField("Example List");
    if (const auto* list = MetaCast<MetaList>(examples.get()); list && list->GetCount() > 0) {
        WriteExamples(*list, width, stream);
    }
    return true;
}

}  // namespace AutoCli
