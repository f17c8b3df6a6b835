#pragma once

#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace AutoCli {

class Dispatcher;
class OptionParser;

/// One line that helps on with a command line that failed, found from its words, the tree and the
/// declarations; empty where nothing is certain. `tool` is what such a line begins with: the name
/// of the tool and a blank, or nothing. `toolOptions` are the names that are known in front of the
/// path. Passes on what a declaration throws.
std::string FindHint(Dispatcher& dispatcher, OptionParser& parser, const std::string& tool,
                     std::span<const std::string_view> toolOptions);

/// The name that is nearest to a mistyped word. Empty when none is at most a third of the word's
/// length away, and when two are equally near.
std::string NearestName(std::string_view word, const std::vector<std::string>& names);

}  // namespace AutoCli
