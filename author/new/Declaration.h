#pragma once

#include <string>
#include <vector>

namespace Author {

/// A parameter, as `--parameter` declares it.
struct NewParameter {
    std::string name;
    std::string type;  ///< as in a descriptor
    bool isRequired = true;
    std::string min;  ///< of the range, if there is one
    std::string max;
    std::vector<std::string> values;  ///< those there are, if they are listed

    [[nodiscard]] bool IsList() const { return type.ends_with("-list"); }
    /// "int" for "int-list".
    [[nodiscard]] std::string ItemType() const { return type.substr(0, type.find('-')); }
    /// A value that a call can give.
    [[nodiscard]] std::string Example() const;
};

struct NewField {
    std::string name;
    std::string type;  ///< "int", "bool" or "string"
};

/// A result, as `--result` declares it: a structure if it has fields, otherwise of a plain type.
struct NewResult {
    std::string type;  ///< or the name of the structure
    bool isList = false;
    std::vector<NewField> fields;
};

struct NewCommand {
    std::vector<std::string> path;
    std::string language;
    std::string script;  ///< its absolute path
    std::vector<NewParameter> parameters;
    NewResult result;

    [[nodiscard]] std::string Path(const char* separator) const;
};

/// These throw `std::invalid_argument` with what is wrong and what to write.
NewParameter ReadParameter(const std::string& spec);
NewResult ReadResult(const std::string& spec);

}  // namespace Author
