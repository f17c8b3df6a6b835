#pragma once

#include <zelmar/Export.h>

#include <map>
#include <memory>
#include <string>
#include <vector>

namespace CallSpec {

class Output;

enum ParameterConstraintType : int {
    ConstraintTypeNone = 0,  ///< everything passes; no parameter accepts such a constraint
    ConstraintTypeIntRange = 1,
    ConstraintTypeIntEnum = 2,
    ConstraintTypeStringEnum = 3,
    ConstraintTypeStringRegex = 4,  ///< the expression must match the whole value
};

/// A rule on each value of a parameter. The kind decides which of the data below it reads; data of
/// another kind may be stored and is never looked at. Once it is filled, several threads may judge
/// by it.
class ZELMAR_EXPORT ParameterConstraint {
public:
    explicit ParameterConstraint(ParameterConstraintType type) : _type(type) {}

    static std::shared_ptr<ParameterConstraint> New(ParameterConstraintType type);

    [[nodiscard]] ParameterConstraintType GetType() const { return _type; }

    /// Both bounds belong to the range, which is 0 to 0 until it is set. Throws `ZelmarException`,
    /// and changes nothing, when `min` lies above `max`: "Invalid values for SetIntRange,
    /// constraints must have a min value <= max value".
    void SetIntRange(long min, long max);
    void GetIntRange(long& min, long& max) const;

    /// An empty description is as none. Throws `ZelmarException`: "Duplicate Value found in
    /// ParameterConstraint::AddIntEnum".
    void AddIntEnum(long value) { AddIntEnum(value, ""); }
    void AddIntEnum(long value, std::string description);
    /// In the order of addition.
    [[nodiscard]] const std::vector<long>& GetIntEnum() const { return _intEnum; }
    /// The members that have a description, by value. Help does not show it, completion does.
    [[nodiscard]] const std::map<long, std::string>& GetIntEnumWithDesc() const {
        return _intEnumDesc;
    }

    /// An empty description is as none. Throws `ZelmarException`: "Duplicate Value found in
    /// ParameterConstraint::AddStringEnum: <value>".
    void AddStringEnum(std::string value, std::string description);
    void AddStringEnum(const char* value, const char* description = "");
    /// In the order of addition.
    [[nodiscard]] const std::vector<std::string>& GetStringEnum() const { return _stringEnum; }
    /// The members that have a description, by value.
    [[nodiscard]] const std::map<std::string, std::string>& GetStringEnumWithDesc() const {
        return _stringEnumDesc;
    }

    /// A Perl-style expression. A text that does not compile shows when a value is judged.
    void SetStringRegex(const std::string& regex) { _regex = regex; }
    [[nodiscard]] const std::string& GetStringRegex() const { return _regex; }

    /// The rule in words, for messages and help.
    [[nodiscard]] std::string ToString() const;

    /// Judges one value. A refusal leaves one message on the output, also when the expression does
    /// not compile or the matching of this value is given up because it would take too long.
    bool Validate(const std::string& value, const std::string& parameterName,
                  const std::shared_ptr<Output>& output) const;

private:
    const ParameterConstraintType _type;
    long _min = 0;
    long _max = 0;
    std::vector<long> _intEnum;
    std::map<long, std::string> _intEnumDesc;
    std::vector<std::string> _stringEnum;
    std::string _regex;
    std::map<std::string, std::string> _stringEnumDesc;
};

}  // namespace CallSpec
