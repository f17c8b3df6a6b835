#include <zelmar/autocli/completion/ShellAnswers.h>
#include <zelmar/internal/ControlCharacters.h>

#include <algorithm>
#include <string_view>

namespace AutoCli {

namespace {

const char* WordFor(CompletionFiles files) {
    switch (files) {
        case CompletionFilesAny:
            return "any";
        case CompletionFilesPlugins:
            return "plugins";
        case CompletionFilesDirectories:
            return "directories";
        case CompletionFilesNone:
            break;
    }
    return "none";
}

const char* WordForBlank(bool isWanted) {
    return isWanted ? "" : "nospace";
}

bool IsContinuation(char c) {
    return (static_cast<unsigned char>(c) & 0xc0) == 0x80;
}

// In whole characters.
std::string CommonBeginning(const Fields& texts) {
    std::string_view common = texts.front();
    for (const std::string& text : texts) {
        size_t length =
            static_cast<size_t>(std::ranges::mismatch(common, text).in1 - common.begin());
        while (length > 0 && length < common.size() && IsContinuation(common[length])) {
            --length;
        }
        common = common.substr(0, length);
    }
    return std::string(common);
}

size_t CountCharacters(std::string_view text) {
    return text.size() - static_cast<size_t>(std::ranges::count_if(text, IsContinuation));
}

// The description in brackets, cut to that many characters; nothing where it would tell too little.
std::string InBrackets(const std::string& description, size_t columns) {
    constexpr size_t least = 10;
    std::string text = "(" + ShowControlCharacters(description) + ")";
    if (description.empty() || CountCharacters(text) <= columns) {
        return description.empty() ? "" : text;
    }
    if (columns < least) {
        return "";
    }
    size_t end = 0;
    for (size_t left = columns - 3; left > 0 || IsContinuation(text[end]); ++end) {
        left -= IsContinuation(text[end]) ? 0 : 1;
    }
    return text.substr(0, end) + "...";
}

// The entries of a list that the line editor shows: names, as far as they are new, behind what was
// typed, and descriptions in a column of their own. The line editor inserts what the entries have
// in common: where that is not what was typed already, control characters being in it, there is no
// list.
Fields BashList(const BashLine& line, const Completion& completion, size_t columns) {
    const size_t typed = line.words.back().size() - completion.stem.size();
    Fields entries;
    size_t widest = 0;
    for (const CompletionCandidate& candidate : completion.candidates) {
        entries.push_back(line.replaced + ShowControlCharacters(candidate.text.substr(typed)));
        widest = std::max(widest, CountCharacters(entries.back()));
    }
    if (CommonBeginning(entries) != line.replaced) {
        return {};
    }
    const size_t left = columns - std::min(columns, widest + 2);
    for (size_t i = 0; i < entries.size(); ++i) {
        const std::string text = InBrackets(completion.candidates[i].description, left);
        if (!text.empty()) {
            entries[i].append(widest - CountCharacters(entries[i]) + 2, ' ') += text;
        }
    }
    return entries;
}

// As _describe wants what stands in front of the colon that opens a description.
std::string QuoteForDescribe(std::string_view text) {
    std::string quoted;
    for (const char c : text) {
        quoted += c == ':' || c == '\\' ? "\\" : "";
        quoted += c;
    }
    return quoted;
}

// A tab would end the candidate for fish, and of the control characters it neutralises only those
// of ASCII. No candidate is better than a wrong one.
bool SuitsFish(std::string_view text) {
    for (; !text.empty(); text.remove_prefix(1)) {
        if (text[0] == '\t' || FindControlCharacter(text).code >= 0x80) {
            return false;
        }
    }
    return true;
}

}  // namespace

Fields AnswerForBash(const BashLine& line, const Completion& completion, bool insertsAll,
                     size_t columns) {
    const auto& candidates = completion.candidates;
    Fields answer = {WordFor(completion.files), WordForBlank(completion.endsWord)};
    const auto insert = [&](const std::string& text) {
        answer.push_back(QuoteForBash((completion.stem + text).substr(line.kept), line.quote));
    };
    if (candidates.size() < 2 || insertsAll) {
        for (const CompletionCandidate& candidate : candidates) {
            insert(candidate.text);
        }
        return answer;
    }
    Fields texts;
    std::ranges::transform(candidates, std::back_inserter(texts), &CompletionCandidate::text);
    const std::string common = CommonBeginning(texts);
    if (completion.stem.size() + common.size() > line.words.back().size()) {
        answer[1] = WordForBlank(false);
        insert(common);
        return answer;
    }
    std::ranges::move(BashList(line, completion, columns), std::back_inserter(answer));
    return answer;
}

Fields AnswerForZsh(const Completion& completion) {
    Fields answer = {WordFor(completion.files), WordForBlank(completion.endsWord), completion.stem,
                     ShowControlCharacters(completion.message)};
    for (const CompletionCandidate& candidate : completion.candidates) {
        answer.push_back(QuoteForDescribe(completion.stem + candidate.text));
    }
    for (const auto& [text, description] : completion.candidates) {
        answer.push_back(QuoteForDescribe(ShowControlCharacters(text)) +
                         (description.empty() ? "" : ":") + ShowControlCharacters(description));
    }
    return answer;
}

Fields AnswerForFish(const Completion& completion) {
    Fields answer = {WordFor(completion.files), completion.stem,
                     ShowControlCharacters(completion.message)};
    for (const auto& [text, description] : completion.candidates) {
        if (SuitsFish(text)) {
            answer.push_back(completion.stem + text + "\t" + ShowControlCharacters(description));
        }
    }
    return answer;
}

}  // namespace AutoCli
