#pragma once

#include <zelmar/Export.h>
#include <zelmar/metaobj/MetaObject.h>

#include <memory>
#include <string>
#include <vector>

namespace CallSpec {

class Output;

/// The declared output of a command: a prototype whose kind and shape the delivered value must
/// have. The prototype's own values are samples.
class ZELMAR_EXPORT OutputSpec {
public:
    static std::shared_ptr<OutputSpec> New();

    void SetDescription(const std::string& description) { _description = description; }
    /// "Documentation missing" until one is set.
    [[nodiscard]] const std::string& GetDescription() const;

    /// Takes any value. Throws `ZelmarException` for null, and keeps the old prototype: "Root
    /// object cannot be set to null".
    void SetRootObject(std::shared_ptr<MetaObj::MetaObject> prototype);
    /// Null until it is set.
    [[nodiscard]] std::shared_ptr<MetaObj::MetaObject> GetRootObject() const { return _rootObject; }

    /// Has the output's value the declared shape? Reasons are appended to `errors` unless that is
    /// null.
    bool Validate(const std::shared_ptr<Output>& output, std::vector<std::string>* errors) const;

private:
    std::shared_ptr<MetaObj::MetaObject> _rootObject;
    std::string _description;

    static const std::string _docMissingStaticString;
};

}  // namespace CallSpec
