#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/formatters/CliDispatcherHelpFormatter.h>
#include <zelmar/autocli/formatters/TableFormatter.h>
#include <zelmar/autocli/formatters/TextWriter.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <ostream>

using CallSpec::Output;
using MetaObj::MetaCast;
using MetaObj::MetaList;
using MetaObj::MetaString;
using MetaObj::MetaStruct;
using MetaObj::MetaType;
using Zelmar::ZelmarException;

namespace AutoCli {

namespace {

std::shared_ptr<MetaList> NodesOfType(const std::string& type, const MetaList& list) {
    auto nodes = MetaList::New(MetaType::Struct, list.GetListStructure());
    for (const auto& item : list.GetObjects()) {
        const auto* node = MetaCast<MetaStruct>(item.get());
        const auto nodeType = node ? node->GetField("Type") : nullptr;
        if (nodeType && nodeType->ToString() == type) {
            nodes->Add(item);
        }
    }
    return nodes;
}

FormatParameters TableWithoutHeader() {
    FormatParameters parameters;
    parameters.SetFormatter("table");
    parameters.SetParameter("fields", "Name,Description");
    parameters.SetParameter("table-header", "false");
    parameters.SetParameter("wrap-last", "true");
    return parameters;
}

}  // namespace

CliDispatcherHelpFormatter::CliDispatcherHelpFormatter() : Formatter("clihelp") {
    _description = "Format the --help output for all commands.";
}

CliDispatcherHelpFormatter::~CliDispatcherHelpFormatter() = default;

bool CliDispatcherHelpFormatter::Format(const std::shared_ptr<Output>& output,
                                        FormatParameters& /*parameters*/, DisplayContext& context,
                                        std::ostream& stream) {
    const auto page = std::dynamic_pointer_cast<MetaStruct>(output->GetRootObject());
    if (!page || page->GetTypeName() != "KelvashCommandPrint") {
        throw ZelmarException(
            "Error: Unexpected type for help output, formatter expected a struct with help data");
    }
    std::string dispatcher;
    ExtractString("Dispatcher", page, dispatcher);
    TextWriter text(stream, context);
    text.Append("Usage: ", dispatcher, " [disp options]");
    if (const auto path = std::dynamic_pointer_cast<MetaList>(page->GetField("Path"))) {
        for (const auto& name : path->GetObjects()) {
            text.Append(" ", name->ToString());
        }
    }
    text.Append(" <namespaces> <command>");
    text.EndLine();
    text.EndLine();
    text.Append("For help please run ", dispatcher, " --help");
    text.EndLine();
    text.EndLine();
    text.Finish();
    const auto nodes = std::dynamic_pointer_cast<MetaList>(page->GetField("NamespaceNodes"));
    HandleList("Namespace", nodes, context, stream);
    HandleList("Command", nodes, context, stream);
    return true;
}

bool CliDispatcherHelpFormatter::ExtractString(const std::string& key,
                                               std::shared_ptr<MetaStruct> structure,
                                               std::string& result) {
    const auto field = structure->GetField(key);
    const auto* text = MetaCast<MetaString>(field.get());
    result = text ? text->GetValue() : "<" + key + ">";
    return text != nullptr;
}

bool CliDispatcherHelpFormatter::HandleList(const std::string& type, std::shared_ptr<MetaList> list,
                                            DisplayContext& context, std::ostream& stream) {
    stream << "Available " << type << "s: " << std::endl << std::endl;
    if (!list) {
        stream << "ERROR, list is bad" << std::endl;
        return true;
    }
    const auto output = Output::New();
    output->SetRootObject(NodesOfType(type, *list));
    FormatParameters parameters = TableWithoutHeader();
    TableFormatter().Format(output, parameters, context, stream);
    stream << std::endl;
    return true;
}

}  // namespace AutoCli
