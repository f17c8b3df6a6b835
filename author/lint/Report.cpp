#include <author/lint/Report.h>
#include <author/lint/Suggest.h>

#include <nlohmann/json.hpp>

#include <algorithm>

namespace Author {

namespace {

constexpr std::string_view blanks = " \t\n\r";

// In the order of the documentation.
const std::vector<std::string> ruleNames = {
    "xml",     "doctype", "schema",  "load",    "content", "parent", "twice",     "name",
    "range",   "regex",   "blanks",  "type",    "slow",    "form",   "spell",     "unquoted",
    "quotes",  "active",  "removed", "visible", "order",   "left",   "lines",     "syntax",
    "unknown", "kind",    "unread",  "bool",    "program", "secret", "formatter", "key",
    "field",   "printf",  "heading", "allow"};

std::string_view Trim(std::string_view text) {
    const size_t begin = std::min(text.find_first_not_of(blanks), text.size());
    return text.substr(begin, text.find_last_not_of(blanks) + 1 - begin);
}

// Takes the word off the text's front, with the blanks behind it.
bool TakeWord(std::string_view& text, std::string_view word) {
    if (!text.starts_with(word)) {
        return false;
    }
    text = Trim(text.substr(word.size()));
    return true;
}

std::string_view CommentText(const xmlNode* comment) {
    return Trim(comment->content ? reinterpret_cast<const char*>(comment->content) : "");
}

// The rule that a comment allows; empty when it is no permission.
std::string_view AllowedRule(const xmlNode* comment) {
    std::string_view text = CommentText(comment);
    if (!TakeWord(text, "lint:") || !TakeWord(text, "allow")) {
        return {};
    }
    const size_t colon = text.find(':');
    const bool hasReason = colon != std::string_view::npos && colon + 1 < text.size();
    return hasReason ? Trim(text.substr(0, colon)) : std::string_view();
}

bool IsBlank(const xmlNode* node) {
    return node->type == XML_TEXT_NODE && xmlIsBlankNode(node) == 1;
}

const char* WordFor(Severity severity) {
    return severity == Severity::Error ? "error" : "warning";
}

// A finding is a line, and what a file holds does not reach a terminal as a command.
std::string OneLine(std::string text) {
    for (char& c : text) {
        c = static_cast<unsigned char>(c) < ' ' || c == '\x7f' ? ' ' : c;
    }
    return text;
}

}  // namespace

bool Report::IsAllowed(const xmlNode* place, std::string_view rule) {
    for (const xmlNode* node = place; node; node = node->parent) {
        for (const xmlNode* before = node->prev;
             before && (IsBlank(before) || before->type == XML_COMMENT_NODE);
             before = before->prev) {
            if (before->type == XML_COMMENT_NODE && AllowedRule(before) == rule) {
                return true;
            }
        }
    }
    return false;
}

void Report::Add(const xmlNode* place, Severity severity, std::string_view rule, std::string text) {
    for (const xmlNode* node = place; node && severity == Severity::Error; node = node->parent) {
        _faulty.insert(node);
    }
    if (!IsAllowed(place, rule)) {
        _findings.push_back(
            {_file, xmlGetLineNo(place), severity, std::string(rule), std::move(text)});
    }
}

void Report::AddAt(long line, std::string_view rule, std::string text) {
    _findings.push_back(
        {_file, std::max(line, 1L), Severity::Error, std::string(rule), std::move(text)});
}

void Report::CheckComments(const xmlNode* root) {
    for (const xmlNode* node = root->children; node; node = node->next) {
        if (node->type == XML_ELEMENT_NODE) {
            CheckComments(node);
        } else if (node->type == XML_COMMENT_NODE && CommentText(node).starts_with("lint:")) {
            const std::string rule(AllowedRule(node));
            if (rule.empty()) {
                AddWarning(node, "allow",
                           "this comment allows nothing; write <!-- lint: allow RULE: reason -->");
            } else if (std::ranges::find(ruleNames, rule) == ruleNames.end()) {
                AddWarning(node, "allow",
                           "there is no rule '" + rule + "'" + Suggestion(rule, ruleNames));
            }
        }
    }
}

std::string AsLines(const std::vector<Finding>& findings) {
    std::string lines;
    for (const Finding& finding : findings) {
        lines += finding.file + ":" + std::to_string(finding.line) + ": " +
                 WordFor(finding.severity) + ": " + OneLine(finding.text) + " [" + finding.rule +
                 "]\n";
    }
    return lines;
}

std::string AsJson(const std::vector<Finding>& findings) {
    auto array = nlohmann::ordered_json::array();
    for (const Finding& finding : findings) {
        array.push_back({{"file", finding.file},
                         {"line", finding.line},
                         {"severity", WordFor(finding.severity)},
                         {"rule", finding.rule},
                         {"text", finding.text}});
    }
    return array.dump(2, ' ', false, nlohmann::ordered_json::error_handler_t::replace) + "\n";
}

}  // namespace Author
