#pragma once

#include <zelmar/autocli/CommandSpec.h>

#include <memory>

namespace AutoCli {

/// A command that can be run. A concrete one supplies its declarations, its work, and a static
/// `New` that makes it owned by a shared pointer.
class ZELMAR_EXPORT Command : public CommandSpec, public CallSpec::CallTarget {
public:
    Command() = default;
    ~Command() override;

    /// The frame around the work; concrete commands leave it alone. Answers a call for `help`;
    /// otherwise runs the command, turns a standard exception into the message "Error on command
    /// <path> : <what>", and checks the output against its declaration. Anything else that is
    /// thrown passes through.
    void Execute(const std::shared_ptr<CallSpec::Input>& input,
                 const std::shared_ptr<CallSpec::Output>& output) override;

    /// The command's work, on input that has passed the checks. It sets the output's value, or adds
    /// messages, or throws.
    virtual void ExecuteInternal(const std::shared_ptr<CallSpec::Input>& input,
                                 const std::shared_ptr<CallSpec::Output>& output) = 0;
};

}  // namespace AutoCli
