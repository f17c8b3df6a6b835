#pragma once

#include <zelmar/zelmar.h>

#include <memory>
#include <string>
#include <vector>

/// What the application is about: the rooms of a house and how warm they are.
struct Room {
    std::string name;
    int celsius;
};

/// `room list`: the rooms, or the warm ones. It reads the application's own rooms, which must
/// outlive it.
class RoomList : public AutoCli::Command {
public:
    explicit RoomList(const std::vector<Room>& rooms);
    static std::shared_ptr<RoomList> New(const std::vector<Room>& rooms);

    std::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal() override;
    std::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal() override;
    void ExecuteInternal(const std::shared_ptr<CallSpec::Input>& input,
                         const std::shared_ptr<CallSpec::Output>& output) override;

private:
    const std::vector<Room>& _rooms;
};
