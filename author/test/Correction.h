#pragma once

#include <author/test/Session.h>

namespace Author {

/// Shows on standard output what a page shows wrongly: at which command its session ended too
/// early, and the page beside what was printed, as a unified diff.
void ShowResult(const Page& page, const PageResult& result);

/// Writes what was printed into the page. Throws `FaultyPage` when a page cannot show it, and
/// leaves the page as it is.
void Update(const Page& page, const PageResult& result);

}  // namespace Author
