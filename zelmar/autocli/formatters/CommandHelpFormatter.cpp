#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/formatters/CommandHelpFormatter.h>
#include <zelmar/autocli/formatters/FitText.h>
#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <algorithm>

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

constexpr std::string_view withoutShortName = "     --";
constexpr size_t nameGap = 3;  // between the longest name and the descriptions
constexpr int exampleIndent = 4;
constexpr int syntaxTail = 8;  // blanks behind each

void WriteParameter(const std::shared_ptr<MetaStruct>& parameter, size_t nameWidth, int screenWidth,
                    TextWriter& out) {
    const std::string name = GetStringField(parameter, "Name");
    const std::string shortName = GetStringField(parameter, "Short Name");
    const std::string description = TaggedDescription(parameter);
    if (shortName.empty()) {
        out.Append(withoutShortName, name);
    } else {
        out.Append("  -", shortName, "|--", name);
    }
    out.AppendBlanks(nameWidth - out.WidthOf(name));
    if (description.empty()) {
        out.EndLine();
        return;
    }
    FitText(description,
            {.indent = static_cast<int>(withoutShortName.size() + nameWidth),
             .width = screenWidth,
             .skipFirstIndent = true,
             .endLine = true,
             .splitLines = true},
            out);
}

void WriteParameters(const MetaList& list, int screenWidth, TextWriter& out) {
    size_t longest = 0;
    for (const auto& item : list.GetObjects()) {
        longest = std::max(longest, out.WidthOf(GetStringField(AsStruct(item), "Name")));
    }
    for (const auto& item : list.GetObjects()) {
        if (const auto parameter = AsStruct(item)) {
            WriteParameter(parameter, longest + nameGap, screenWidth, out);
        }
    }
}

void WriteExamples(const MetaList& list, int screenWidth, TextWriter& out) {
    out.EndLine();
    out.Append("Examples: ");
    out.EndLine();
    out.EndLine();
    for (const auto& item : list.GetObjects()) {
        const auto example = AsStruct(item);
        FitText(GetStringField(example, "Description"),
                {.indent = exampleIndent, .width = screenWidth, .endLine = true}, out);
        out.Append(GetStringField(example, "Syntax"));
        out.AppendBlanks(syntaxTail);
        out.EndLine();
        out.EndLine();
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
    TextWriter text(stream, context);
    text.Append("Usage: ", GetStringField(help, "Dispatcher"), " ", GetStringField(help, "Path"),
                " <options>");
    text.EndLine();
    text.EndLine();
    text.Append("Description: ", GetStringField(help, "Description"));
    text.EndLine();
    text.EndLine();
    const auto parameters = help->GetField("Param List");
    if (const auto* list = MetaCast<MetaList>(parameters.get())) {
        WriteParameters(*list, context.screenWidth, text);
    }
    const auto examples = help->GetField("Example List");
    if (const auto* list = MetaCast<MetaList>(examples.get()); list && list->GetCount() > 0) {
        WriteExamples(*list, context.screenWidth, text);
    }
    text.Finish();
    return true;
}

}  // namespace AutoCli
