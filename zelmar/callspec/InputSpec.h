#pragma once

#include <zelmar/Export.h>
#include <zelmar/callspec/ParameterSpec.h>

#include <memory>
#include <set>
#include <string>
#include <vector>

namespace CallSpec {

class Input;
class Output;

/// The declared parameters of a command, sorted by long name. Long names have at least two
/// characters; long names are unique, and so are short names.
class ZELMAR_EXPORT InputSpec {
public:
    static std::shared_ptr<InputSpec> New();

    /// Throws `ZelmarException`, and changes nothing: "Parameter name must be at least 2
    /// characters"; "Found a duplicate paramater specification for parameter named '<name>'";
    /// "Invalid short name specified for --<name>. The short name -<short> is already used for
    /// --<other name>".
    void AddParameter(const std::shared_ptr<ParameterSpec>& parameter);

    [[nodiscard]] const std::vector<std::shared_ptr<ParameterSpec>>& GetParameterSpecs() const {
        return _parameters;
    }
    /// The parameter of that long name, or null. It lives as long as this specification.
    [[nodiscard]] const ParameterSpec* FindParameterSpec(const std::string& name) const;
    /// The same for the name of an option, which may be the short one.
    [[nodiscard]] const ParameterSpec* FindOption(const std::string& name) const;

    /// Declares that the command wants this context value of its input.
    void SetContextSupported(const std::string& name) { _contexts.insert(name); }
    [[nodiscard]] bool IsContextSupported(const std::string& name) const {
        return _contexts.contains(name);
    }

    /// Checks all of the input; each complaint becomes a message on the output: first what is wrong
    /// with the given parameters, in the order of their names, then the required ones that are
    /// missing. An input that asks for `help` is not checked at all.
    bool Validate(const std::shared_ptr<Input>& input, const std::shared_ptr<Output>& output) const;

private:
    void RequireNamesFree(const ParameterSpec& parameter) const;

    std::vector<std::shared_ptr<ParameterSpec>> _parameters;
    std::set<std::string> _contexts;
};

}  // namespace CallSpec
