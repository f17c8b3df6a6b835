#include <zelmar/autocli/CommandList.h>
#include <zelmar/autocli/Namespace.h>
#include <zelmar/metaobj/MetaList.h>

using CallSpec::Input;
using CallSpec::InputSpec;
using CallSpec::Output;
using CallSpec::OutputSpec;
using CallSpec::ParameterSpec;
using MetaObj::MetaList;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace AutoCli {

namespace {

std::shared_ptr<ParameterSpec> FilterParameter(const char* name, const char* shortName,
                                               const char* description) {
    auto filter = ParameterSpec::New(name, CallSpec::ParameterTypeString);
    filter->SetShortName(shortName);
    filter->SetDescription(description);
    filter->SetRequired(false);
    return filter;
}

bool Contains(const std::string& text, const std::string& filter) {
    return text.find(filter) != std::string::npos;
}

}  // namespace

CommandList::~CommandList() = default;

std::shared_ptr<CommandList> CommandList::New(std::shared_ptr<Namespace> root) {
    auto command = std::make_shared<CommandList>(root.get());
    command->SetDescription("List all of the kelvash commands.");
    command->SetReadOnly();
    command->SetDefaultOutputFormatter("table");
    command->SetDefaultOutputParameter("fields:KelVashCommand", "Namespace,Command,Description");
    command->SetDefaultOutputParameter("wrap-last", "true");
    return command;
}

std::shared_ptr<MetaStruct> CommandList::GetOutputStructure() {
    auto row = MetaStruct::New("KelVashCommand");
    row->SetField("Namespace", "");
    row->SetField("Command", "");
    row->SetField("Description", "");
    return row;
}

std::shared_ptr<InputSpec> CommandList::GetInputSpecInternal() {
    auto spec = InputSpec::New();
    spec->AddParameter(FilterParameter(
        "namespace-filter", "n",
        "Show only commands containing the specified string in their namespace path."));
    spec->AddParameter(
        FilterParameter("command-filter", "c",
                        "Show only commands containing the specified string in their name."));
    spec->AddParameter(FilterParameter(
        "description-filter", "d",
        "Show only commands containing the specified string in their description."));
    return spec;
}

std::shared_ptr<OutputSpec> CommandList::GetOutputSpecInternal() {
    auto spec = OutputSpec::New();
    spec->SetRootObject(MetaList::New(MetaType::Struct, GetOutputStructure()));
    return spec;
}

void CommandList::ExecuteInternal(const std::shared_ptr<Input>& input,
                                  const std::shared_ptr<Output>& output) {
    const auto list = MetaList::New(MetaType::Struct, GetOutputStructure());
    AddChildren(input->GetParameter("namespace-filter"), input->GetParameter("command-filter"),
                input->GetParameter("description-filter"), _root, list.get());
    output->SetRootObject(list);
}

void CommandList::AddChildren(const std::string& namespaceFilter, const std::string& commandFilter,
                              const std::string& descriptionFilter, NamespaceNode* node,
                              MetaList* list) {
    const std::string path = node->GetPathString('.');
    for (const auto& child : node->GetNamespaceNodes()) {
        if (child->GetType() == NodeTypeNamespace) {
            AddChildren(namespaceFilter, commandFilter, descriptionFilter, child.get(), list);
        } else if (child->GetType() == NodeTypeCommand && Contains(path, namespaceFilter) &&
                   Contains(child->GetName(), commandFilter) &&
                   Contains(child->GetDescription(), descriptionFilter)) {
            auto row = GetOutputStructure();
            row->SetField("Command", child->GetName());
            row->SetField("Namespace", path);
            row->SetField("Description", child->GetDescription());
            list->Add(row);
        }
    }
}

}  // namespace AutoCli
