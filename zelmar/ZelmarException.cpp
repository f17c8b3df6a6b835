#include <zelmar/ZelmarException.h>

#include <utility>

namespace Zelmar {

ZelmarException::ZelmarException(std::string message) : _message(std::move(message)) {}

ZelmarException::~ZelmarException() = default;

const char* ZelmarException::what() const noexcept {
    return _message.c_str();
}

}  // namespace Zelmar
