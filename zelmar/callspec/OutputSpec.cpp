#include <zelmar/ZelmarException.h>
#include <zelmar/callspec/Output.h>
#include <zelmar/callspec/OutputSpec.h>

using Zelmar::ZelmarException;

namespace CallSpec {

const std::string OutputSpec::_docMissingStaticString = "Documentation missing";

std::shared_ptr<OutputSpec> OutputSpec::New() {
    return std::make_shared<OutputSpec>();
}

const std::string& OutputSpec::GetDescription() const {
    return _description.empty() ? _docMissingStaticString : _description;
}

void OutputSpec::SetRootObject(std::shared_ptr<MetaObj::MetaObject> prototype) {
    if (!prototype) {
        throw ZelmarException("Root object cannot be set to null");
    }
    _rootObject = std::move(prototype);
}

bool OutputSpec::Validate(const std::shared_ptr<Output>& output,
                          std::vector<std::string>* errors) const {
    const auto refuse = [errors](const char* reason) {
        if (errors) {
            errors->emplace_back(reason);
        }
        return false;
    };
    if (!_rootObject) {
        return refuse(
            "No root object set for output spec. Root object for output spec must be set for"
            " proper validation of output.");
    }
    const auto value = output->GetRootObject();
    if (!value) {
        return refuse("No root object set for output. The command did not provide proper output.");
    }
    return _rootObject->IsSameStructure(value, errors);
}

}  // namespace CallSpec
