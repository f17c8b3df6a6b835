#include "JsonLines.h"

#include "Text.h"

JsonLinesFormatter::JsonLinesFormatter() : Formatter("jsonl") {
    _description =
        "Print JSON in UTF-8, one line for each item of a list, for programs that read line by"
        " line.";
    _params = {{"whole", "If 'true' print a list on one line as well, as an array"}};
}

bool JsonLinesFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                                AutoCli::FormatParameters& parameters,
                                AutoCli::DisplayContext& /*context*/, std::ostream& stream) {
    Text text(stream);
    const auto writeLine = [&text](const MetaObj::MetaObject* value) {
        AutoCli::AutoCli_WriteJsonText(value,
                                       [&text](std::string_view piece) { text.Append(piece); });
        text.Append("\n");
    };
    const auto root = output->GetRootObject();
    const auto* list = MetaObj::MetaCast<MetaObj::MetaList>(root.get());
    if (list && parameters.GetParameter("whole") != "true") {
        for (const auto& item : list->GetObjects()) {
            writeLine(item.get());
        }
    } else {
        writeLine(root.get());
    }
    text.Finish();
    return true;
}
