// A plugin that throws what only its own code can tell of.

#include "Answer.h"

class Riddle : public std::exception {
public:
    [[nodiscard]] const char* what() const noexcept override { return "Nobody knows the answer."; }
};

extern "C" ZELMAR_EXPORT void AutoCli_RegisterNamespaces(std::shared_ptr<AutoCli::Namespace>) {
    throw Riddle();
}
