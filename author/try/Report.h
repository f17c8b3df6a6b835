#pragma once

#include <cstddef>
#include <ostream>
#include <string>
#include <string_view>
#include <vector>

namespace Author {

/// Hides secrets in texts: each stands there as dots, also in the ways in which templates write it.
class Secrets {
public:
    static constexpr const char* dots = "••••";

    void Add(const std::string& value);
    [[nodiscard]] std::string Hide(std::string text) const;

private:
    std::vector<std::string> _texts;  // the longest first
};

/// The report of one trial: sections with a title and indented lines. Control characters are shown
/// as \xHH.
class TrialReport {
public:
    TrialReport(std::ostream& stream, const Secrets& secrets)
        : _stream(stream), _secrets(secrets) {}

    /// Nothing when the text is empty.
    void Section(std::string_view title, const std::string& text);
    /// The same, for what counts as findings.
    void Findings(std::string_view title, const std::vector<std::string>& lines, size_t count);
    [[nodiscard]] size_t Found() const { return _found; }

private:
    std::ostream& _stream;
    const Secrets& _secrets;
    size_t _found = 0;
};

}  // namespace Author
