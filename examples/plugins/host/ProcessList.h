#pragma once

#include <zelmar/zelmar.h>

#include <memory>

namespace Host {

/// `host process list`: the processes, or those that pass all given filters.
class ProcessList : public AutoCli::Command {
public:
    ProcessList();
    static std::shared_ptr<ProcessList> New();

    std::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal() override;
    std::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal() override;
    void ExecuteInternal(const std::shared_ptr<CallSpec::Input>& input,
                         const std::shared_ptr<CallSpec::Output>& output) override;
};

}  // namespace Host
