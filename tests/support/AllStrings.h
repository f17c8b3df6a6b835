#pragma once

#include <string>
#include <string_view>

/// Visits every string over the alphabet that is no longer than that, the empty one included.
template <class Visit>
void ForEachString(std::string_view alphabet, size_t longest, Visit visit,
                   const std::string& prefix = "") {
    visit(prefix);
    if (prefix.size() < longest) {
        for (const char c : alphabet) {
            ForEachString(alphabet, longest, visit, prefix + c);
        }
    }
}
