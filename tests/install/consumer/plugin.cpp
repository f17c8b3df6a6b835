// A plugin with one command: greeting get --from WHOM.

#include <zelmar/zelmar.h>
#include <memory>
#include <string>

namespace {

class GreetingGet : public AutoCli::Command {
public:
    std::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal() override {
        auto spec = CallSpec::InputSpec::New();
        spec->AddParameter(CallSpec::ParameterSpec::New("from", CallSpec::ParameterTypeString));
        return spec;
    }

    std::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal() override {
        auto spec = CallSpec::OutputSpec::New();
        spec->SetRootObject(MetaObj::MetaString::New("greeting"));
        return spec;
    }

    void ExecuteInternal(const std::shared_ptr<CallSpec::Input>& input,
                         const std::shared_ptr<CallSpec::Output>& output) override {
        output->SetRootObject(
            MetaObj::MetaString::New("Hello from " + input->GetParameter("from")));
    }
};

}  // namespace

extern "C" __attribute__((visibility("default"))) void AutoCli_RegisterNamespaces(
    std::shared_ptr<AutoCli::Namespace> root) {
    root->SubNamespace("greeting")->RegisterNamespaceNode(std::make_shared<GreetingGet>(), "get");
}
