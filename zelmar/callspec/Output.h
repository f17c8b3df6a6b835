#pragma once

#include <zelmar/Export.h>
#include <zelmar/metaobj/MetaObject.h>

#include <memory>
#include <string>
#include <vector>

namespace CallSpec {

/// What one call produced: a value, or the messages of its failure. A call has failed exactly when
/// there is a message; messages are never taken back.
class ZELMAR_EXPORT Output {
public:
    /// How the front end picks the format.
    enum OutputType : int {
        OutputTypeNormal = 0,       ///< by the command's default format parameters
        OutputTypeUnformatted = 1,  ///< printed only when the user names a formatter
        OutputTypeHelp = 2,         ///< help text, by the formatter "commandhelp"
    };

    Output() = default;
    virtual ~Output();

    static std::shared_ptr<Output> New();

    [[nodiscard]] bool HasError() const { return !_errors.empty(); }
    [[nodiscard]] const std::vector<std::string>& GetErrors() const { return _errors; }
    void AddErrorMessage(const std::string& message) { _errors.push_back(message); }
    void AddErrorMessage(std::string&& message) { _errors.push_back(std::move(message)); }
    void AddErrorMessage(const char* message) { _errors.emplace_back(message); }

    /// Null until it is set.
    [[nodiscard]] std::shared_ptr<MetaObj::MetaObject> GetRootObject() const { return _rootObject; }
    /// Takes any value; it is shared, not copied.
    void SetRootObject(const std::shared_ptr<MetaObj::MetaObject>& value) { _rootObject = value; }

    [[nodiscard]] OutputType GetOutputType() const { return _outputType; }
    void SetOutputType(OutputType type) { _outputType = type; }

private:
    std::vector<std::string> _errors;
    std::shared_ptr<MetaObj::MetaObject> _rootObject;
    OutputType _outputType = OutputTypeNormal;
};

}  // namespace CallSpec
