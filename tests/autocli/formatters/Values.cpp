#include "Values.h"

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

std::shared_ptr<MetaStruct> Names() {
    auto names = MetaStruct::New("Names");
    names->SetField("", 0);
    names->SetField("two words", 1);
    names->SetField(R"(<"quoted">)", 2);
    names->SetField(EveryByte(), 3);
    return names;
}

// Values whose class does not fit their kind, and one of no kind.
std::shared_ptr<MetaStruct> Misfits() {
    auto misfits = MetaStruct::New("Misfits");
    for (const int kind : {0, 1, 2, 3, 4, 7}) {
        misfits->SetField(std::to_string(kind), std::make_shared<Misfit>(MetaType(kind)));
    }
    return misfits;
}

}  // namespace

std::map<std::string, Value> SampleValues() {
    std::ostringstream document;
    document << std::ifstream(TESTS_DIR "/autocli/formatters/data/values.xml").rdbuf();
    const auto samples = AutoCli::XmlUtil_ParseXmlOutput(document.str());
    std::map<std::string, Value> values = {
        {"every byte", MetaString::New(EveryByte())},
        {"names", Names()},
        {"nothing", nullptr},
        {"misfit", std::make_shared<Misfit>(MetaType::Struct)},
        {"misfits", Misfits()},
    };
    for (const auto& [name, field] : std::static_pointer_cast<MetaStruct>(samples)->GetFields()) {
        values[name] = field.value;
    }
    const auto& disks = static_cast<const MetaList&>(*values["structs"]);
    values["no structs"] = MetaList::New(MetaType::Struct, disks.GetListStructure());
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
