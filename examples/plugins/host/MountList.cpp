#include "MountList.h"

#include "Mounts.h"

#include <cstring>
#include <fstream>

using CallSpec::ConstraintTypeIntRange;
using CallSpec::ConstraintTypeStringRegex;
using CallSpec::Input;
using CallSpec::InputSpec;
using CallSpec::Output;
using CallSpec::OutputSpec;
using CallSpec::ParameterConstraint;
using CallSpec::ParameterSpec;
using CallSpec::ParameterTypeInt;
using CallSpec::ParameterTypeString;
using MetaObj::MetaInt;
using MetaObj::MetaList;
using MetaObj::MetaString;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace Host {

namespace {

constexpr const char* mountTable = "/proc/self/mounts";
constexpr std::chrono::milliseconds patience(1000);
constexpr long largestSize = 1000000000;  // MiB

// The fields of one row. The values are samples of their kinds; "Options" is a list of strings.
std::shared_ptr<MetaStruct> MountShape() {
    auto shape = MetaStruct::New("Mount");
    shape->SetField("Path", MetaString::New(), "Where it is mounted");
    shape->SetField("Type", MetaString::New(), "The type of the file system");
    shape->SetField("Source", MetaString::New(), "The device or server, or what stands for it");
    shape->SetField("Options", MetaList::New(MetaType::String), "The mount options");
    shape->SetField("Size", MetaInt::New(), "MiB in all");
    shape->SetField("Used", MetaInt::New(), "MiB in use");
    shape->SetField("Available", MetaInt::New(), "MiB that are free for all users");
    shape->SetField("State", MetaString::New(), "ok, or why there are no sizes");
    return shape;
}

// The kernel does not care which bytes a name holds, but the readers of our output do.
std::shared_ptr<MetaString> Text(std::string name) {
    return MetaString::NewUtf8WithEscapes(std::move(name));
}

std::shared_ptr<MetaStruct> MountRow(const std::shared_ptr<MetaStruct>& shape, const Mount& mount,
                                     const Capacity& capacity) {
    auto options = MetaList::New(MetaType::String);
    for (const std::string& option : mount.options) {
        options->Add(Text(option));
    }
    auto row = MetaStruct::New(shape);
    row->SetField("Path", Text(mount.path));
    row->SetField("Type", Text(mount.type));
    row->SetField("Source", Text(mount.source));
    row->SetField("Options", options);
    row->SetField("Size", capacity.size);
    row->SetField("Used", capacity.used);
    row->SetField("Available", capacity.available);
    row->SetField("State", capacity.error == 0 ? "ok" : std::strerror(capacity.error));
    return row;
}

}  // namespace

MountList::MountList() {
    SetDescription("List the mounted file systems with their sizes");
    SetReadOnly();
    SetDefaultOutputFormatter("table");
    SetDefaultOutputParameter("fields", "Path,Type,Size,Used,Available,State");
    SetDefaultOutputParameter("units:Mount.Size", "MiB");
    SetDefaultOutputParameter("units:Mount.Used", "MiB");
    SetDefaultOutputParameter("units:Mount.Available", "MiB");
    AddExample("--type ext4", "List the file systems of one type");
    AddExample("--minimum-size 1", "Leave out those that hold no data of their own");
}

std::shared_ptr<MountList> MountList::New() {
    return std::make_shared<MountList>();
}

std::shared_ptr<InputSpec> MountList::GetInputSpecInternal() {
    auto typeRule = ParameterConstraint::New(ConstraintTypeStringRegex);
    typeRule->SetStringRegex("[A-Za-z0-9._-]+");
    auto type = ParameterSpec::New("type", ParameterTypeString);
    type->SetShortName("t");
    type->SetDescription("Only file systems of this type, such as ext4.");
    type->SetRequired(false);
    type->SetConstraint(typeRule);

    auto sizeRule = ParameterConstraint::New(ConstraintTypeIntRange);
    sizeRule->SetIntRange(0, largestSize);
    auto minimumSize = ParameterSpec::New("minimum-size", ParameterTypeInt);
    minimumSize->SetShortName("m");
    minimumSize->SetDescription("Only file systems of at least this size in MiB: %REGEX%.");
    minimumSize->SetRequired(false);
    minimumSize->SetConstraint(sizeRule);

    auto spec = InputSpec::New();
    spec->AddParameter(type);
    spec->AddParameter(minimumSize);
    return spec;
}

std::shared_ptr<OutputSpec> MountList::GetOutputSpecInternal() {
    auto spec = OutputSpec::New();
    spec->SetDescription("One struct for each mount, in the order of mounting");
    spec->SetRootObject(MetaList::New(MetaType::Struct, MountShape()));
    return spec;
}

void MountList::ExecuteInternal(const std::shared_ptr<Input>& input,
                                const std::shared_ptr<Output>& output) {
    std::ifstream table(mountTable);
    std::vector<Mount> mounts = ReadMounts(table);
    if (!table.is_open() || table.bad()) {
        output->AddErrorMessage(std::string("Unable to read ") + mountTable);
        return;
    }
    if (input->HasParameter("type")) {
        const std::string& type = input->GetParameter("type");
        std::erase_if(mounts, [&](const Mount& mount) { return mount.type != type; });
    }

    const std::vector<Capacity> capacities = MeasureMounts(mounts, patience);
    const long minimumSize = input->GetParameterInt("minimum-size");  // -1 when it was not given
    const auto shape = MountShape();
    auto list = MetaList::New(MetaType::Struct, shape);
    for (size_t i = 0; i < mounts.size(); ++i) {
        if (capacities[i].size >= minimumSize) {
            list->Add(MountRow(shape, mounts[i], capacities[i]));
        }
    }
    output->SetRootObject(list);
}

}  // namespace Host
