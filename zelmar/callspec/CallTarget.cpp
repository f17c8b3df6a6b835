#include <zelmar/callspec/CallTarget.h>

namespace CallSpec {

CallTarget::~CallTarget() = default;

CallTargetSpec::~CallTargetSpec() = default;

}  // namespace CallSpec
