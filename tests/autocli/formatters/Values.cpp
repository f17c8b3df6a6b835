#include "Values.h"

#include <zelmar/autocli/Dispatcher.h>

#include <limits>

using MetaObj::MetaBool;
using MetaObj::MetaInt;
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

std::shared_ptr<MetaStruct> Disk(const std::string& name, long size) {
    auto disk = MetaStruct::New("Disk");
    disk->SetField("Name", name);
    disk->SetField("Size", size);
    disk->SetField("Removable", size < 100);
    return disk;
}

std::shared_ptr<MetaList> Disks() {
    auto list = MetaList::New(MetaType::Struct, Disk("", 0));
    list->Add(Disk("sda", 512));
    list->Add(Disk("sdb1", 16));
    return list;
}

// A list in a struct in a struct in a list, each with scalars around it.
std::shared_ptr<MetaStruct> Host(const std::string& name) {
    auto controller = MetaStruct::New("Controller");
    controller->SetField("Disks", Disks());
    controller->SetField("Ports", std::vector<long>{1, -2});
    auto host = MetaStruct::New("Host");
    host->SetField("Controller", controller);
    host->SetField("Name", name);
    host->SetField("Up", true);
    return host;
}

std::shared_ptr<MetaList> Hosts() {
    auto list = MetaList::New(MetaType::Struct, Host(""));
    list->Add(Host("alpha"));
    list->Add(Host("beta"));
    return list;
}

std::shared_ptr<MetaList> Numbers() {
    using Limits = std::numeric_limits<long>;
    auto list = MetaList::New(MetaType::Int);
    list->AddAll(std::vector<long>{Limits::min(), -1, 0, Limits::max()});
    return list;
}

std::shared_ptr<MetaList> ListOf(const std::shared_ptr<MetaStruct>& item) {
    auto list = MetaList::New(MetaType::Struct, item);
    list->Add(item);
    return list;
}

std::shared_ptr<MetaStruct> Texts() {
    auto texts = MetaStruct::New("Texts");
    texts->SetField("empty", "");
    texts->SetField("lines", "one\ntwo\r\n\tthree\n");
    texts->SetField("markup", R"(<a href="x">100% 'R&D'</a> &lt; // \)");
    texts->SetField("quotes", R"("ends in a quote")");
    texts->SetField("utf8", "Zürich \u20ac \U0001F600");
    return texts;
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
    const auto lists = listOf(MetaType::List);
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

std::vector<std::pair<std::string, Value>> SampleValues() {
    return {
        {"bool", MetaBool::New(true)},
        {"int", MetaInt::New(std::numeric_limits<long>::min())},
        {"empty string", MetaString::New()},
        {"every byte", MetaString::New(EveryByte())},
        {"empty struct", MetaStruct::New("Nothing")},
        {"empty list", MetaList::New(MetaType::String)},
        {"empty list of structs", MetaList::New(MetaType::Struct, Disk("", 0))},
        {"list of integers", Numbers()},
        {"list of structs", Disks()},
        {"nested struct", Host("alpha")},
        {"nested list", Hosts()},
        {"texts", ListOf(Texts())},
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
