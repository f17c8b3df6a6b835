#pragma once

#include <zelmar/zelmar.h>

#include <list>
#include <string>
#include <string_view>
#include <vector>

namespace KelvashShell {

using Path = std::list<std::string>;

/// The words of a whole line, or of a half-typed one up to the cursor, whose last word may be
/// empty. None for a comment.
std::vector<std::string> WordsOf(const std::string& line);
std::vector<std::string> WordsUpToCursor(const std::string& line);

/// Where the path begins: behind the options of the tool.
size_t BeginOfPath(const std::vector<std::string>& words);

/// The node at a path, the root for an empty one; null when there is none.
std::shared_ptr<AutoCli::NamespaceNode> FindNode(AutoCli::Dispatcher& dispatcher, const Path& path);

/// What may become of a line that was typed.
enum class Keeping {
    None,     ///< it shows a secret
    Session,  ///< it is not understood, so that anything in it may be a secret
    Always,
};
Keeping KeepingOf(AutoCli::Dispatcher& dispatcher, const std::vector<std::string>& words);

/// The names of files that can follow behind a stem, as candidates: folders end in a slash.
std::vector<AutoCli::CompletionCandidate> FilesBehind(const std::string& typed,
                                                      AutoCli::CompletionFiles kind);

/// What of the candidates' common beginning is still to be typed behind a half-typed word, in
/// quotes where it needs some; with a blank when there is but one and it ends the word. Candidates
/// that cannot be typed, as those with quotes in them, have no say.
std::string TextToInsert(const std::string& line, const std::string& typed,
                         const AutoCli::Completion& completion);

}  // namespace KelvashShell
