#include <author/try/Report.h>
#include <zelmar/zelmar.h>

#include <algorithm>
#include <cstdio>

namespace Author {

void Secrets::Add(const std::string& value) {
    const AutoCli::ExtensionCommand writer;
    for (const std::string& text :
         {value, writer.SanitizeInput(value), writer.SanitizeChar(value, '\''),
          writer.SanitizeChar(value, '"')}) {
        if (!text.empty()) {
            _texts.push_back(text);
        }
    }
    std::ranges::stable_sort(_texts, std::ranges::greater(), &std::string::size);
}

std::string Secrets::Hide(std::string text) const {
    for (const std::string& secret : _texts) {
        for (size_t at = 0; (at = text.find(secret, at)) != std::string::npos;) {
            text.replace(at, secret.size(), dots);
            at += std::string_view(dots).size();
        }
    }
    return text;
}

void TrialReport::Section(std::string_view title, const std::string& text) {
    if (text.empty()) {
        return;
    }
    std::string shown(title);
    bool atStart = true;
    shown += '\n';
    for (const char c : _secrets.Hide(text)) {
        shown += atStart && c != '\n' ? "  " : "";
        atStart = c == '\n';
        const auto byte = static_cast<unsigned char>(c);
        if ((byte < ' ' && c != '\n' && c != '\t') || byte == 0x7f) {
            char escape[5];
            std::snprintf(escape, sizeof escape, "\\x%02X", byte);
            shown += escape;
        } else {
            shown += c;
        }
    }
    _stream << shown << (atStart ? "" : "\n") << std::flush;
}

void TrialReport::Findings(std::string_view title, const std::vector<std::string>& lines,
                           size_t count) {
    std::string text;
    for (const std::string& line : lines) {
        text += line + "\n";
    }
    if (count > lines.size()) {
        text += "and " + std::to_string(count - lines.size()) + " more\n";
    }
    _found += count;
    Section(title, text);
}

}  // namespace Author
