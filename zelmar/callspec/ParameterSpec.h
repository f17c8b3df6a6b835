#pragma once

#include <zelmar/Export.h>
#include <zelmar/callspec/ParameterConstraint.h>

#include <memory>
#include <string>
#include <vector>

namespace CallSpec {

class Output;

/// The type of a parameter's values. A list type is the type of its values plus 4.
enum ParameterType : int {
    ParameterTypeString = 0,
    ParameterTypeInt = 1,
    ParameterTypeBool = 2,
    ParameterTypeFlag = 3,  ///< given or not; its one value is empty
    ParameterTypeStringList = 4,
    ParameterTypeIntList = 5,
    ParameterTypeBoolList = 6,
};

/// The declaration of one parameter. A new one is required, holds no secret, and has no short name,
/// no description and no constraint.
class ZELMAR_EXPORT ParameterSpec {
public:
    ParameterSpec(std::string&& name, ParameterType type);

    /// The name is the long option without its dashes. Throws `ZelmarException`: "Invalid Parameter
    /// name '<name>' parameter names can only contain lower-case alphanumeric characters, numbers
    /// and '-'".
    static std::shared_ptr<ParameterSpec> New(const std::string& name, ParameterType type);
    static std::shared_ptr<ParameterSpec> New(const char* name, ParameterType type);
    static std::shared_ptr<ParameterSpec> New(std::string&& name, ParameterType type);

    [[nodiscard]] const std::string& GetName() const { return _name; }
    [[nodiscard]] ParameterType GetParameterType() const { return _type; }
    [[nodiscard]] ParameterType GetType() const { return _type; }

    /// One ASCII letter or digit. Throws `ZelmarException`, and keeps the old one: "Invalid value
    /// for shortName, must be a single character a-z, A-Z or 0-9".
    void SetShortName(std::string shortName);
    void SetShortName(const char* shortName) { SetShortName(std::string(shortName)); }
    /// Empty when there is none.
    [[nodiscard]] const std::string& GetShortName() const { return _shortName; }

    void SetDescription(std::string description) { _description = std::move(description); }
    void SetDescription(const char* description) { _description = description; }
    /// The text as it was set or, when `expand` is true and there is a constraint, with the first
    /// %REGEX% and %ENUM% replaced by the constraint in words, and the first %FULLENUM% by one
    /// indented line for each described member of a string enumeration.
    [[nodiscard]] std::string GetDescription(bool expand) const;

    /// The kind must fit the type; null changes nothing. Throws `ZelmarException`, and keeps the
    /// old constraint: "Invalid constraint specified for parameter <name>.  The parameter
    /// constraint specified is not allowed for a parameter of this type."
    void SetConstraint(const std::shared_ptr<ParameterConstraint>& constraint);
    /// Null when there is none.
    [[nodiscard]] std::shared_ptr<ParameterConstraint> GetConstraint() const { return _constraint; }

    void SetRequired(bool required) { _required = required; }
    [[nodiscard]] bool IsRequired() const { return _required; }

    /// A secret given without a value is asked for at a prompt that does not echo. Only plain
    /// strings can be secret; otherwise throws `ZelmarException`: "Cannot be set for parameter
    /// <name>".
    void SetSecret(bool secret);
    [[nodiscard]] bool IsSecret() const { return _secret; }

    /// Does it take any number of values?
    [[nodiscard]] bool AllowMultiple() const { return _type > ParameterTypeFlag; }

    /// The whole text as a decimal number; leading white space and a sign are accepted, and a
    /// number beyond 64 bits reads as the nearest limit. False leaves `out` alone.
    static bool GetInt(const std::string& text, long& out);
    /// One of 1, yes, y, true, True, t, T or 0, no, n, false, False, f, F. False leaves `out`
    /// alone.
    static bool GetBool(const std::string& text, bool& out);

    /// Judges all values given for this parameter; every complaint becomes a message on the output.
    bool Validate(const std::vector<std::string>& values,
                  const std::shared_ptr<Output>& output) const;

private:
    bool ValidateCount(size_t count, Output& output) const;
    bool ValidateType(const std::string& value, Output& output) const;

    const ParameterType _type;
    const std::string _name;
    std::string _shortName;
    std::string _description;
    std::shared_ptr<ParameterConstraint> _constraint;
    bool _required = true;
    bool _secret = false;
};

}  // namespace CallSpec
