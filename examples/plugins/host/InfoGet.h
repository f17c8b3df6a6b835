#pragma once

#include <zelmar/zelmar.h>

#include <memory>

namespace Host {

/// `host info get`: facts about this machine and its memory.
class InfoGet : public AutoCli::Command {
public:
    InfoGet();
    static std::shared_ptr<InfoGet> New();

    std::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal() override;
    std::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal() override;
    void ExecuteInternal(const std::shared_ptr<CallSpec::Input>& input,
                         const std::shared_ptr<CallSpec::Output>& output) override;
};

}  // namespace Host
