#pragma once

#include <zelmar/Export.h>

#include <memory>

namespace CallSpec {

class Input;
class InputSpec;
class Output;
class OutputSpec;

/// What can be called with an input, to fill an output.
class ZELMAR_EXPORT CallTarget {
public:
    virtual ~CallTarget();
    virtual void Execute(const std::shared_ptr<Input>& input,
                         const std::shared_ptr<Output>& output) = 0;
};

/// What declares the input that it takes and the output that it gives.
class ZELMAR_EXPORT CallTargetSpec {
public:
    virtual ~CallTargetSpec();
    virtual std::shared_ptr<InputSpec> GetInputSpec() = 0;
    virtual std::shared_ptr<OutputSpec> GetOutputSpec() = 0;
};

}  // namespace CallSpec
