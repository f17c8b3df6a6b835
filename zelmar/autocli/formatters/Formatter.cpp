#include <zelmar/autocli/formatters/FieldText.h>
#include <zelmar/autocli/formatters/Formatter.h>
#include <zelmar/autocli/formatters/SafePrintf.h>
#include <zelmar/internal/ControlCharacters.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <system_error>

using MetaObj::MetaBool;
using MetaObj::MetaCast;
using MetaObj::MetaInt;
using MetaObj::MetaObject;
using MetaObj::MetaString;
using MetaObj::MetaStruct;

namespace AutoCli {

namespace {

// False when the format fails; a struct or a list has no printf argument and comes out empty.
bool ApplyPrintf(const std::string& format, const MetaObject& value, std::string& text) {
    constexpr size_t slack = 64;
    const size_t limit = format.size() + text.size() + slack;
    if (const auto* number = MetaCast<MetaInt>(&value)) {
        return FormatSafely(format, number->GetValue(), limit, text);
    }
    if (const auto* truth = MetaCast<MetaBool>(&value)) {
        return FormatSafely(format, truth->GetValue() ? 1L : 0L, limit, text);
    }
    if (const auto* string = MetaCast<MetaString>(&value)) {
        return FormatSafely(format, string->GetValue().c_str(), limit, text);
    }
    text.clear();
    return true;
}

}  // namespace

Formatter::~Formatter() = default;

std::string AutoCli_FormatField(const std::string& typeName, const std::string& fieldName,
                                std::shared_ptr<MetaObject> value, FormatParameters& parameters) {
    if (!value) {
        return "NULL Object";
    }
    std::string text = value->ToString();
    const std::string field = typeName + "." + fieldName;
    const std::string printfKey = "printf:" + field;
    if (parameters.HasParameter(printfKey) &&
        !ApplyPrintf(parameters.GetParameter(printfKey), *value, text)) {
        return "Error while handling formatting parameter " + printfKey +
               ".  Unable to format field: " + std::generic_category().message(errno);
    }
    const std::string unitsKey = "units:" + field;
    if (parameters.HasParameter(unitsKey)) {
        text += " " + parameters.GetParameter(unitsKey);
    }
    return text;
}

std::string AutoCli_ShowControls(std::string_view text) {
    return ShowControlCharacters(text, "\n\t");
}

std::string AutoCli_ErrorText(std::string_view text) {
    return isatty(STDERR_FILENO) == 1 ? AutoCli_ShowControls(text) : std::string(text);
}

std::string GetIndent(int level) {
    return std::string(static_cast<size_t>(std::max(level, 0)) * 3, ' ');
}

std::shared_ptr<MetaObject> GetSubField(std::shared_ptr<MetaStruct> structure,
                                        const std::string& path) {
    const auto* value = FindSubField(*structure, path);
    return value ? *value : nullptr;
}

}  // namespace AutoCli
