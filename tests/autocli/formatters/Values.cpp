#include "Values.h"

#include <zelmar/autocli/Dispatcher.h>
#include <zelmar/autocli/extension/XmlOutput.h>

#include <fstream>
#include <sstream>

using MetaObj::MetaList;
using MetaObj::MetaString;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace {

std::string EveryByte() {
    std::string text;
    for (int byte = 0; byte < 0x100; ++byte) {
        text += static_cast<char>(byte);
    }
    return text;
}

// The values of data/values.xml, by name.
std::shared_ptr<MetaStruct> Samples() {
    std::ostringstream document;
    document << std::ifstream(TESTS_DIR "/autocli/formatters/data/values.xml").rdbuf();
    return std::dynamic_pointer_cast<MetaStruct>(AutoCli::XmlUtil_ParseXmlOutput(document.str()));
}

std::shared_ptr<MetaList> ListOf(const std::shared_ptr<MetaStruct>& item) {
    auto list = MetaList::New(MetaType::Struct, item);
    list->Add(item);
    return list;
}

std::shared_ptr<MetaStruct> Names() {
    auto names = MetaStruct::New("Names");
    names->SetField("", 0);
    names->SetField("two words", 1);
    names->SetField(R"(<"quoted">)", 2);
    names->SetField(EveryByte(), 3);
    return names;
}

// Values whose class does not fit their kind, alone and between others.
std::shared_ptr<MetaStruct> Misfits() {
    auto misfits = MetaStruct::New("Misfits");
    misfits->SetField("a", std::make_shared<Misfit>(MetaType::Int));
    misfits->SetField("b", std::make_shared<Misfit>(MetaType::Struct));
    misfits->SetField("c", 1);
    return misfits;
}

// The factories refuse lists of lists and of no known kind; the constructor does not.
std::shared_ptr<MetaList> Lists() {
    const auto listOf = [](MetaType type) {
        return std::make_shared<MetaList>(type, nullptr, MetaObj::MetaObject::FactoryFlag());
    };
    auto lists = listOf(MetaType::List);
    for (const MetaType type : {MetaType::Bool, MetaType::Int, MetaType::String, MetaType::List,
                                MetaType::Struct, MetaType(7)}) {
        lists->Add(listOf(type));
    }
    return lists;
}

Value Help() {
    AutoCli::Dispatcher dispatcher;
    auto input = AutoCli::CommandInput::New();
    input->SetDispatcher("kelvash");
    input->SetCommandPath({"kelvash", "command", "list"});
    input->AddParameter("help", "true");
    auto output = AutoCli::CommandOutput::New();
    dispatcher.ExecuteCommand(input, output);
    return output->GetRootObject();
}

}  // namespace

std::map<std::string, Value> SampleValues() {
    std::map<std::string, Value> values = {
        {"every byte", MetaString::New(EveryByte())},
        {"names", ListOf(Names())},
        {"help", Help()},
        {"nothing", nullptr},
        {"misfits", Misfits()},
        {"misfit bool", std::make_shared<Misfit>(MetaType::Bool)},
        {"misfit int", std::make_shared<Misfit>(MetaType::Int)},
        {"misfit string", std::make_shared<Misfit>(MetaType::String)},
        {"misfit struct", std::make_shared<Misfit>(MetaType::Struct)},
        {"misfit list", std::make_shared<Misfit>(MetaType::List)},
        {"misfit of no kind", std::make_shared<Misfit>(MetaType(7))},
        {"lists of every kind", Lists()},
    };
    const auto samples = Samples();
    for (const auto& [name, field] : samples->GetFields()) {
        values[name] = field.value;
    }
    const auto& disks = static_cast<const MetaList&>(*values["list of structs"]);
    values["empty list of structs"] = MetaList::New(MetaType::Struct, disks.GetListStructure());
    return values;
}

Value NestedStructs(int levels) {
    Value value = MetaString::New("core");
    for (int level = 0; level < levels; ++level) {
        auto around = MetaStruct::New("Level");
        around->SetField("in", value);
        value = around;
    }
    return value;
}
