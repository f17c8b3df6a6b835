#include <zelmar/callspec/Output.h>

namespace CallSpec {

Output::~Output() = default;

std::shared_ptr<Output> Output::New() {
    return std::make_shared<Output>();
}

}  // namespace CallSpec
