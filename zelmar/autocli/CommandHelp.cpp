// The help of a command as a value, built from what the command declares.

#include <zelmar/autocli/CommandInput.h>
#include <zelmar/autocli/CommandSpec.h>
#include <zelmar/metaobj/MetaList.h>

using MetaObj::MetaList;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace AutoCli {

namespace {

// The shapes are set even where there is no entry, so that a list always knows its columns.
std::shared_ptr<MetaStruct> ParameterShape() {
    auto shape = MetaStruct::New("KelVashCommandParameter");
    shape->SetField("Name", "");
    shape->SetField("Short Name", "");
    shape->SetField("Description", "");
    shape->SetField("Required", false);
    shape->SetField("Secret", false);
    return shape;
}

std::shared_ptr<MetaStruct> ExampleShape() {
    auto shape = MetaStruct::New("KelVashCommandExample");
    shape->SetField("Description", "");
    shape->SetField("Syntax", "");
    return shape;
}

std::shared_ptr<MetaList> ParameterList(const CallSpec::InputSpec& spec) {
    const auto shape = ParameterShape();
    auto list = MetaList::New(MetaType::Struct, shape);
    for (const auto& parameter : spec.GetParameterSpecs()) {
        auto entry = MetaStruct::New(shape);
        entry->SetField("Name", parameter->GetName());
        entry->SetField("Short Name", parameter->GetShortName());
        entry->SetField("Description", parameter->GetDescription(true));
        entry->SetField("Required", parameter->IsRequired());
        entry->SetField("Secret", parameter->IsSecret());
        list->Add(entry);
    }
    return list;
}

std::shared_ptr<MetaList> ExampleList(const CommandSpec& command, const std::string& usage) {
    const auto shape = ExampleShape();
    auto list = MetaList::New(MetaType::Struct, shape);
    for (const auto& [syntax, description] : command.GetExamples()) {
        auto entry = MetaStruct::New(shape);
        entry->SetField("Description", description + " :");
        entry->SetField("Syntax", "# " + usage + " " + syntax);
        list->Add(entry);
    }
    return list;
}

}  // namespace

void CommandSpec::GenerateHelpOutput(const std::shared_ptr<CallSpec::Input>& input,
                                     const std::shared_ptr<CallSpec::Output>& output) {
    auto help = MetaStruct::New("KelVashCommandHelp");
    std::string usage;
    if (const auto call = std::dynamic_pointer_cast<CommandInput>(input)) {
        help->SetField("Dispatcher", call->GetDispatcher());
        help->SetField("Path", call->GetCommandPathString());
        usage = call->GetDispatcher() + " " + call->GetCommandPathString();
    }
    help->SetField("Description", GetDescription());
    help->SetField("Param List", ParameterList(*GetInputSpec()));
    help->SetField("Example List", ExampleList(*this, usage));
    output->SetRootObject(help);
    output->SetOutputType(CallSpec::Output::OutputTypeHelp);
}

}  // namespace AutoCli
