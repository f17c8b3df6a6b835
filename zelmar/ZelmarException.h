#pragma once

#include <zelmar/Export.h>

#include <exception>
#include <string>

namespace Zelmar {

/// The library's one exception: a declaration, or the use of an interface, is wrong. What is wrong
/// with a call (user input, a command's result) is no exception but a message of its Output.
/// A layer that adds to a message throws a new exception with the old text inside the new one.
class ZELMAR_EXPORT ZelmarException : public std::exception {
public:
    explicit ZelmarException(std::string message);
    ~ZelmarException() override;

    [[nodiscard]] const char* what() const noexcept override;

private:
    std::string _message;
};

}  // namespace Zelmar
