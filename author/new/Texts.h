#pragma once

#include <author/new/Declaration.h>

#include <string_view>

namespace Author {

/// What a script uses to print; it stands beside it.
struct Helper {
    const char* name;
    std::string_view text;
};
extern const Helper shHelper;
extern const Helper perlHelper;
extern const Helper pythonHelper;

/// The files of a new command. Their names are those of the command.
std::string DescriptorOf(const NewCommand& command);
std::string PageOf(const NewCommand& command);
/// In the language of the command; they print an example.
std::string ShScriptOf(const NewCommand& command);
std::string PythonScriptOf(const NewCommand& command);
std::string PerlScriptOf(const NewCommand& command);

/// What every text begins with before somebody has written another one.
std::string DescriptionOf(const NewParameter& parameter);
inline constexpr const char* commandDescription = "Say here what the command does";

}  // namespace Author
