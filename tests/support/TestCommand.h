#pragma once

#include <zelmar/autocli/Command.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <functional>
#include <memory>
#include <utility>
#include <vector>

/// A command that declares the given parameters and an Int, and does what it is told.
class TestCommand : public AutoCli::Command {
public:
    using Work = std::function<void(const std::shared_ptr<CallSpec::Output>&)>;
    using Parameters = std::vector<std::shared_ptr<CallSpec::ParameterSpec>>;

    TestCommand(Work work, Parameters parameters)
        : _work(std::move(work)), _parameters(std::move(parameters)) {}

    static std::shared_ptr<TestCommand> New(Work work = Answer, Parameters parameters = {}) {
        return std::make_shared<TestCommand>(std::move(work), std::move(parameters));
    }

    static void Answer(const std::shared_ptr<CallSpec::Output>& output) {
        output->SetRootObject(MetaObj::MetaInt::New(42));
    }

    std::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal() override {
        ++declared;
        auto spec = CallSpec::InputSpec::New();
        for (const auto& parameter : _parameters) {
            spec->AddParameter(parameter);
        }
        return spec;
    }

    std::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal() override {
        auto spec = CallSpec::OutputSpec::New();
        spec->SetRootObject(MetaObj::MetaInt::New());
        return spec;
    }

    void ExecuteInternal(const std::shared_ptr<CallSpec::Input>& /*input*/,
                         const std::shared_ptr<CallSpec::Output>& output) override {
        ++executed;
        _work(output);
    }

    int declared = 0;
    int executed = 0;

private:
    const Work _work;
    const Parameters _parameters;
};
