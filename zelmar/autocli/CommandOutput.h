#pragma once

#include <zelmar/callspec/Output.h>

#include <memory>
#include <string>

namespace AutoCli {

/// The output of a dispatched call. The formatted string is the host's own: nothing in the library
/// reads or writes it.
class ZELMAR_EXPORT CommandOutput : public CallSpec::Output {
public:
    CommandOutput() = default;
    ~CommandOutput() override;

    static std::shared_ptr<CommandOutput> New();

    void SetFormattedString(const std::string& text) { _formattedString = text; }
    [[nodiscard]] const std::string& GetFormattedString() const { return _formattedString; }

private:
    std::string _formattedString;
};

}  // namespace AutoCli
