#pragma once

#include <author/test/Page.h>

#include <chrono>
#include <utility>

namespace Author {

/// What the commands of a page find in their folder and their environment.
struct SessionOptions {
    std::vector<std::string> environment;  ///< each NAME=VALUE; beside it there is HOME alone
    std::vector<std::pair<std::string, std::string>> links;  ///< names and what they lead to
    std::chrono::seconds limit{0};                           ///< for a page
};

/// A command that printed something else than its page shows, as whole lines of a page.
struct Difference {
    const PageCommand* command;
    std::string printed;
};

struct PageResult {
    std::vector<Difference> differences;
    const PageCommand* unended = nullptr;  ///< the command at which the session ended too early
    bool isInTime = true;                  ///< or the time did
};

/// Runs the steps of a page, which must outlive the result, in one session of sh in an empty
/// folder, of which nothing is left. At its end, or that of its time, all processes end that it
/// started. Throws as `RunGuarded` does.
PageResult RunPage(const Page& page, const SessionOptions& options);

}  // namespace Author
