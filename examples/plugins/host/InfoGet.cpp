#include "InfoGet.h"

#include <sys/sysinfo.h>
#include <sys/utsname.h>

using CallSpec::ConstraintTypeStringEnum;
using CallSpec::Input;
using CallSpec::InputSpec;
using CallSpec::Output;
using CallSpec::OutputSpec;
using CallSpec::ParameterConstraint;
using CallSpec::ParameterSpec;
using CallSpec::ParameterTypeString;
using MetaObj::MetaInt;
using MetaObj::MetaString;
using MetaObj::MetaStruct;

namespace Host {

namespace {

constexpr const char* defaultUnit = "MiB";

unsigned long BytesIn(const std::string& unit) {
    return unit == "KiB" ? 1UL << 10 : unit == "MiB" ? 1UL << 20 : 1UL << 30;
}

// What is filled in here is also the declared shape, which takes no more than the kinds from it.
std::shared_ptr<MetaStruct> Memory(const struct sysinfo& system, const std::string& unit) {
    const auto inUnit = [&](unsigned long amount) {
        return MetaInt::New(static_cast<long>(amount * system.mem_unit / BytesIn(unit)));
    };
    auto memory = MetaStruct::New("Memory");
    memory->SetField("Total", inUnit(system.totalram), "All of it, in the unit");
    memory->SetField("Free", inUnit(system.freeram), "What nothing uses, in the unit");
    memory->SetField("Unit", MetaString::New(unit), "KiB, MiB or GiB");
    return memory;
}

std::shared_ptr<MetaStruct> Machine(const utsname& names, const struct sysinfo& system,
                                    const std::string& unit) {
    auto machine = MetaStruct::New("Machine");
    machine->SetField("Name", MetaString::NewUtf8WithEscapes(names.nodename), "Its host name");
    machine->SetField("Architecture", MetaString::New(names.machine), "Such as x86_64");
    machine->SetField("Kernel", MetaString::New(names.release), "The release of the kernel");
    machine->SetField("Processors", MetaInt::New(get_nprocs()), "How many are in use");
    machine->SetField("Uptime", MetaInt::New(system.uptime), "Seconds since its start");
    machine->SetField("Memory", Memory(system, unit), "Its main memory");
    return machine;
}

}  // namespace

InfoGet::InfoGet() {
    SetDescription("Show facts about this machine and its memory");
    SetReadOnly();
    SetDefaultOutputFormatter("simple");
    SetDefaultOutputParameter("fields:Machine",
                              "Name,Architecture,Kernel,Processors,Uptime,Memory");
    SetDefaultOutputParameter("fields:Memory", "Total,Free,Unit");
    SetDefaultOutputParameter("header:Memory", "<NONE>");
    SetDefaultOutputParameter("units:Machine.Uptime", "s");
    SetDefaultOutputParameter("align-fields", "true");
    AddExample("--memory-unit GiB", "Show the memory of a large machine");
}

std::shared_ptr<InfoGet> InfoGet::New() {
    return std::make_shared<InfoGet>();
}

std::shared_ptr<InputSpec> InfoGet::GetInputSpecInternal() {
    auto units = ParameterConstraint::New(ConstraintTypeStringEnum);
    units->AddStringEnum("KiB", "1024 bytes");
    units->AddStringEnum("MiB", "1024 KiB");
    units->AddStringEnum("GiB", "1024 MiB");
    auto unit = ParameterSpec::New("memory-unit", ParameterTypeString);
    unit->SetShortName("m");
    unit->SetDescription("The unit for amounts of memory, MiB if none is given:%FULLENUM%");
    unit->SetRequired(false);
    unit->SetConstraint(units);

    auto spec = InputSpec::New();
    spec->AddParameter(unit);
    return spec;
}

std::shared_ptr<OutputSpec> InfoGet::GetOutputSpecInternal() {
    auto spec = OutputSpec::New();
    spec->SetDescription("One struct, with another one for the memory inside");
    spec->SetRootObject(Machine({}, {}, defaultUnit));
    return spec;
}

void InfoGet::ExecuteInternal(const std::shared_ptr<Input>& input,
                              const std::shared_ptr<Output>& output) {
    utsname names = {};
    struct sysinfo system = {};
    if (uname(&names) != 0 || sysinfo(&system) != 0) {
        output->AddErrorMessage("Unable to ask the kernel about this machine");
        return;
    }
    const bool hasUnit = input->HasParameter("memory-unit");
    output->SetRootObject(
        Machine(names, system, hasUnit ? input->GetParameter("memory-unit") : defaultUnit));
}

}  // namespace Host
