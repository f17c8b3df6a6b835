#pragma once

#include <zelmar/zelmar.h>

#include <memory>

/// A command that gives the integer 42.
class Answer : public AutoCli::Command {
public:
    std::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal() override {
        return CallSpec::InputSpec::New();
    }
    std::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal() override {
        auto spec = CallSpec::OutputSpec::New();
        spec->SetRootObject(MetaObj::MetaInt::New());
        return spec;
    }
    void ExecuteInternal(const std::shared_ptr<CallSpec::Input>& /*input*/,
                         const std::shared_ptr<CallSpec::Output>& output) override {
        output->SetRootObject(MetaObj::MetaInt::New(42));
    }
};
