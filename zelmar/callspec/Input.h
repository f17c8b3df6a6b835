#pragma once

#include <zelmar/Export.h>
#include <zelmar/callspec/ParameterSpec.h>

#include <map>
#include <memory>
#include <string>
#include <vector>

namespace CallSpec {

class InputSpec;

/// What one call is given: parameters, each with its raw values in the order they were added, and
/// context values of the host. The typed reads look the parameter up in the specification that the
/// dispatcher sets before it checks the input; a name that is not declared throws
/// `ZelmarException`: "Request for unknown parameter: <name>".
class ZELMAR_EXPORT Input {
public:
    Input() = default;
    virtual ~Input();

    static std::shared_ptr<Input> New();

    /// Stores the declaration and moves what was given by a one-letter name behind the values that
    /// stand under the full name.
    void SetInputSpec(std::shared_ptr<InputSpec> spec);

    /// Raw access, which does not look at the declaration.
    [[nodiscard]] const std::map<std::string, std::vector<std::string>>& GetParameters() const {
        return _parameters;
    }
    void AddParameter(const std::string& name, const std::string& value);
    [[nodiscard]] bool HasParameter(const std::string& name) const;
    [[nodiscard]] bool HasParameter(const char* name) const;
    [[nodiscard]] bool IsFlagSet(const std::string& name) const { return HasParameter(name); }
    [[nodiscard]] bool IsFlagSet(const char* name) const { return HasParameter(name); }
    /// Appends all values to `out`; an absent parameter appends nothing.
    void GetParameterList(const std::string& name, std::vector<std::string>& out) const;
    void GetParameterList(const char* name, std::vector<std::string>& out) const;
    /// Appends the number of each value that is one, and skips the others.
    void GetParameterIntList(const std::string& name, std::vector<long>& out) const;
    /// Appends true for each value that spells true, and false for any other.
    void GetParameterBoolList(const std::string& name, std::vector<bool>& out) const;
    /// The values joined by the separator; `quote` puts one pair of double quotes around the whole.
    [[nodiscard]] std::string GetParameterListAsString(const std::string& name, char separator,
                                                       bool quote) const;

    [[nodiscard]] ParameterType GetParameterType(const std::string& name) const;

    /// The single value; empty when there is none or more than one. The reference lives as long as
    /// the value stands in this input. Throws `ZelmarException`: "Request for GetParameter on a
    /// flag type parameter: <name>"; "Request for GetParameter on a parameter that can have
    /// multiple values: <name>".
    [[nodiscard]] const std::string& GetParameter(const std::string& name) const;
    [[nodiscard]] const std::string& GetParameter(const char* name) const;
    /// -1 when `GetParameter` gives no number. Throws as that does.
    [[nodiscard]] long GetParameterInt(const std::string& name) const;
    [[nodiscard]] long GetParameterInt(const char* name) const;
    /// False when `GetParameter` gives nothing that spells true. Throws as that does.
    [[nodiscard]] bool GetParameterBool(const std::string& name) const;
    [[nodiscard]] bool GetParameterBool(const char* name) const;

    /// Empty for an absent key.
    [[nodiscard]] const std::string& GetContext(const std::string& key) const;
    void SetContext(const std::string& key, const std::string& value) { _context[key] = value; }

private:
    [[nodiscard]] const std::vector<std::string>& Values(const std::string& name) const;

    std::map<std::string, std::vector<std::string>> _parameters;
    std::map<std::string, std::string> _context;
    std::shared_ptr<InputSpec> _inputSpec;
};

}  // namespace CallSpec
