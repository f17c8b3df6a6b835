#pragma once

#include <zelmar/zelmar.h>

#include <memory>

namespace Host {

/// `host mount list`: the mounted file systems with their sizes.
class MountList : public AutoCli::Command {
public:
    MountList();
    static std::shared_ptr<MountList> New();

    std::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal() override;
    std::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal() override;
    void ExecuteInternal(const std::shared_ptr<CallSpec::Input>& input,
                         const std::shared_ptr<CallSpec::Output>& output) override;
};

}  // namespace Host
