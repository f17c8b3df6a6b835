#include "RoomList.h"

using CallSpec::InputSpec;
using CallSpec::OutputSpec;
using CallSpec::ParameterConstraint;
using CallSpec::ParameterSpec;
using MetaObj::MetaInt;
using MetaObj::MetaList;
using MetaObj::MetaString;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace {

std::shared_ptr<MetaStruct> RoomShape() {
    auto shape = MetaStruct::New("Room");
    shape->SetField("Name", MetaString::New(), "The name of the room");
    shape->SetField("Temperature", MetaInt::New(), "Its temperature in degrees Celsius");
    return shape;
}

}  // namespace

RoomList::RoomList(const std::vector<Room>& rooms) : _rooms(rooms) {
    SetDescription("List the rooms, or the warm ones");
    SetDefaultOutputFormatter("table");
    SetDefaultOutputParameter("units:Room.Temperature", "C");
}

std::shared_ptr<RoomList> RoomList::New(const std::vector<Room>& rooms) {
    return std::make_shared<RoomList>(rooms);
}

std::shared_ptr<InputSpec> RoomList::GetInputSpecInternal() {
    auto range = ParameterConstraint::New(CallSpec::ConstraintTypeIntRange);
    range->SetIntRange(0, 40);
    auto minimum = ParameterSpec::New("minimum", CallSpec::ParameterTypeInt);
    minimum->SetDescription("The lowest temperature to list");
    minimum->SetRequired(false);
    minimum->SetConstraint(range);

    auto spec = InputSpec::New();
    spec->AddParameter(minimum);
    return spec;
}

std::shared_ptr<OutputSpec> RoomList::GetOutputSpecInternal() {
    auto spec = OutputSpec::New();
    spec->SetRootObject(MetaList::New(MetaType::Struct, RoomShape()));
    return spec;
}

void RoomList::ExecuteInternal(const std::shared_ptr<CallSpec::Input>& input,
                               const std::shared_ptr<CallSpec::Output>& output) {
    const long minimum = input->GetParameterInt("minimum");  // -1 when it was not given
    const auto shape = RoomShape();
    auto list = MetaList::New(MetaType::Struct, shape);
    for (const Room& room : _rooms) {
        if (room.celsius >= minimum) {
            auto row = MetaStruct::New(shape);
            row->SetField("Name", room.name);
            row->SetField("Temperature", room.celsius);
            list->Add(row);
        }
    }
    output->SetRootObject(list);
}
