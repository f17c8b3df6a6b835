#include "ProcessList.h"

#include "Pattern.h"
#include "Processes.h"
#include "Users.h"

#include <map>
#include <set>

using CallSpec::ConstraintTypeIntRange;
using CallSpec::ConstraintTypeStringRegex;
using CallSpec::Input;
using CallSpec::InputSpec;
using CallSpec::Output;
using CallSpec::OutputSpec;
using CallSpec::ParameterConstraint;
using CallSpec::ParameterSpec;
using CallSpec::ParameterType;
using CallSpec::ParameterTypeIntList;
using CallSpec::ParameterTypeString;
using MetaObj::MetaInt;
using MetaObj::MetaList;
using MetaObj::MetaString;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace Host {

namespace {

constexpr const char* processTable = "/proc";
constexpr long largestNumber = 1L << 22;  // the kernel's own limit

std::shared_ptr<MetaStruct> ProcessShape() {
    auto shape = MetaStruct::New("Process");
    shape->SetField("Pid", MetaInt::New(), "The number of the process");
    shape->SetField("Parent", MetaInt::New(), "The number of its parent, or 0");
    shape->SetField("User", MetaString::New(), "The user that it acts as");
    shape->SetField("State", MetaString::New(), "What it does just now, such as sleeping");
    shape->SetField("Memory", MetaInt::New(), "KiB of memory in use");
    shape->SetField("Name", MetaString::New(), "The short name of its program");
    shape->SetField("Command", MetaString::New(), "The command line, or the name in brackets");
    return shape;
}

std::shared_ptr<MetaStruct> ProcessRow(const std::shared_ptr<MetaStruct>& shape,
                                       const Process& process, const std::string& user) {
    auto row = MetaStruct::New(shape);
    row->SetField("Pid", process.number);
    row->SetField("Parent", process.parent);
    row->SetField("User", user);
    row->SetField("State", process.state);
    row->SetField("Memory", process.memory);
    row->SetField("Name", MetaString::NewUtf8WithEscapes(std::string(process.name)));
    row->SetField("Command", MetaString::NewUtf8WithEscapes(std::string(process.command)));
    return row;
}

std::shared_ptr<MetaList> ProcessRows(const std::vector<Process>& processes) {
    const auto shape = ProcessShape();
    auto list = MetaList::New(MetaType::Struct, shape);
    std::map<uid_t, std::string> users;  // there are far fewer users than processes
    for (const Process& process : processes) {
        const auto [user, isNew] = users.try_emplace(process.user);
        if (isNew) {
            user->second = UserName(process.user);
        }
        list->Add(ProcessRow(shape, process, user->second));
    }
    return list;
}

std::shared_ptr<ParameterSpec> OptionalParameter(const char* name, const char* shortName,
                                                 ParameterType type, const char* description) {
    auto parameter = ParameterSpec::New(name, type);
    parameter->SetShortName(shortName);
    parameter->SetDescription(description);
    parameter->SetRequired(false);
    return parameter;
}

}  // namespace

ProcessList::ProcessList() {
    SetDescription("List the processes, or those that pass all given filters");
    SetReadOnly();
    SetDefaultOutputFormatter("table");
    SetDefaultOutputParameter("fields", "Pid,User,State,Memory,Command");
    SetDefaultOutputParameter("units:Process.Memory", "KiB");
    SetDefaultOutputParameter("wrap-last", "true");
    AddExample("--user root --name '^ssh'", "List the processes of a user by the start of a name");
    AddExample("--pid 1 --pid 2", "List two processes");
}

std::shared_ptr<ProcessList> ProcessList::New() {
    return std::make_shared<ProcessList>();
}

std::shared_ptr<InputSpec> ProcessList::GetInputSpecInternal() {
    auto user = OptionalParameter("user", "u", ParameterTypeString,
                                  "Only processes of this user, a name or a number.");

    // Counts and back references could cost any amount of memory and time.
    auto nameRule = ParameterConstraint::New(ConstraintTypeStringRegex);
    nameRule->SetStringRegex("[^{}\\\\]{1,64}");
    auto name = OptionalParameter("name", "n", ParameterTypeString,
                                  "Only processes in whose name this extended regular expression "
                                  "is found. It has no braces and no backslashes.");
    name->SetConstraint(nameRule);

    auto numberRule = ParameterConstraint::New(ConstraintTypeIntRange);
    numberRule->SetIntRange(1, largestNumber);
    auto number = OptionalParameter("pid", "p", ParameterTypeIntList,
                                    "Only the process of this number. Can be given repeatedly.");
    number->SetConstraint(numberRule);

    auto spec = InputSpec::New();
    spec->AddParameter(user);
    spec->AddParameter(name);
    spec->AddParameter(number);
    return spec;
}

std::shared_ptr<OutputSpec> ProcessList::GetOutputSpecInternal() {
    auto spec = OutputSpec::New();
    spec->SetDescription("One struct for each process, in the order of their numbers");
    spec->SetRootObject(MetaList::New(MetaType::Struct, ProcessShape()));
    return spec;
}

void ProcessList::ExecuteInternal(const std::shared_ptr<Input>& input,
                                  const std::shared_ptr<Output>& output) {
    // An absent parameter reads as empty, and the empty expression is found in all.
    const std::string& expression = input->GetParameter("name");
    const Pattern pattern(expression);
    if (const std::string complaint = pattern.Complaint(); !complaint.empty()) {
        output->AddErrorMessage("Invalid regular expression '" + expression +
                                "' for parameter name: " + complaint);
    }
    const std::string& userName = input->GetParameter("user");
    const auto user = FindUser(userName);
    if (input->HasParameter("user") && !user) {
        output->AddErrorMessage("There is no user named '" + userName + "'");
    }
    if (output->HasError()) {
        return;
    }
    std::vector<long> given;
    input->GetParameterIntList("pid", given);
    const std::set<long> numbers(given.begin(), given.end());

    std::vector<Process> processes = ReadProcesses(processTable);
    std::erase_if(processes, [&](const Process& process) {
        return (user && process.user != *user) || !pattern.Matches(process.name) ||
               (!numbers.empty() && !numbers.contains(process.number));
    });
    output->SetRootObject(ProcessRows(processes));
}

}  // namespace Host
