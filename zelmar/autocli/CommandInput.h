#pragma once

#include <zelmar/callspec/Input.h>

#include <list>
#include <memory>
#include <string>

namespace AutoCli {

/// The input of a dispatched call: it also names the command.
class ZELMAR_EXPORT CommandInput : public CallSpec::Input {
public:
    CommandInput() = default;
    ~CommandInput() override;

    static std::shared_ptr<CommandInput> New();

    /// The name under which the user called the tool.
    void SetDispatcher(const std::string& name) { _dispatcher = name; }
    [[nodiscard]] const std::string& GetDispatcher() const { return _dispatcher; }

    /// The path from the root of the tree to the command, one name an entry.
    void SetCommandPath(const std::list<std::string>& path) { _commandPath = path; }
    [[nodiscard]] const std::list<std::string>& GetCommandPath() const { return _commandPath; }
    /// The path joined by blanks.
    [[nodiscard]] std::string GetCommandPathString() const;

private:
    std::string _dispatcher;
    std::list<std::string> _commandPath;
};

}  // namespace AutoCli
