// What the shells are told. The scripts are short, for the work is here: what they hand over is the
// line as it is, and what they get is ready to be inserted or shown.
//
//     bash  asks with the line up to the cursor, COMP_WORDBREAKS, COMP_TYPE and COLUMNS; the answer
//           is the kind of files, "nospace" or nothing, and the entries of COMPREPLY
//     zsh   asks with the words; the answer is the kind of files, "nospace" or nothing, the stem,
//           the message, all words to insert, and then all entries for _describe
//     fish  asks with the words; the answer is the kind of files, the stem, the message, and the
//           candidates with tab and description

#include <zelmar/autocli/Dispatcher.h>
#include <zelmar/autocli/OptionParser.h>
#include <zelmar/autocli/completion/AnswerCompletion.h>
#include <zelmar/autocli/completion/BashLine.h>
#include <zelmar/autocli/completion/Completer.h>
#include <zelmar/internal/ControlCharacters.h>
#include <zelmar/internal/Split.h>

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <iostream>
#include <string_view>

namespace AutoCli {

namespace {

using Fields = std::vector<std::string>;

constexpr size_t longestQuestion = 4 << 20;

void SilenceErrors() {
    const int nothing = open("/dev/null", O_WRONLY | O_CLOEXEC);
    dup2(nothing, STDERR_FILENO);
    close(nothing);
}

Fields ReadQuestion() {
    std::string text;
    char block[65536];
    ssize_t count = 0;
    while (text.size() < longestQuestion && (count = read(STDIN_FILENO, block, sizeof block)) > 0) {
        text.append(block, static_cast<size_t>(count));
    }
    Fields fields;
    ForEachPiece(text, '\0', [&fields](std::string_view field) { fields.emplace_back(field); });
    return fields;
}

// The shells leave a tilde as it was typed.
std::string WithHome(const std::string& path) {
    const char* const home = std::getenv("HOME");
    return home && path.starts_with("~/") ? home + path.substr(1) : path;
}

void LoadPlugins(Dispatcher& dispatcher, Fields words) {
    words.pop_back();
    OptionParser parser;
    parser.ParseVector(std::move(words));
    for (const std::string& directory : parser.GetDispatcherParameter("plugin-dir")) {
        dispatcher.AddExternalDirectory(WithHome(directory));
    }
    for (const std::string& path : parser.GetDispatcherParameter("plugin")) {
        try {
            dispatcher.AddPlugin(WithHome(path));
        } catch (const std::exception&) {
            // The call will tell; a Tab is silent.
        }
    }
}

// The first of the words is the name of the tool.
Completion CompleteLine(Dispatcher& dispatcher, Fields words) {
    if (words.size() < 2) {
        return {};
    }
    words.erase(words.begin());
    LoadPlugins(dispatcher, words);
    return Completer(dispatcher).Complete(std::move(words));
}

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
std::string CommonBeginning(const std::vector<CompletionCandidate>& candidates) {
    std::string_view common = candidates.front().text;
    for (const CompletionCandidate& candidate : candidates) {
        size_t length =
            static_cast<size_t>(std::ranges::mismatch(common, candidate.text).in1 - common.begin());
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

// At most `columns` characters, the last three being dots when that cuts the text.
std::string Fit(std::string text, size_t columns) {
    if (CountCharacters(text) <= columns) {
        return text;
    }
    size_t end = 0;
    for (size_t left = std::max<size_t>(columns, 3) - 3; end < text.size(); ++end) {
        if (!IsContinuation(text[end]) && left-- == 0) {
            break;
        }
    }
    return text.substr(0, end) + "...";
}

// The entries of a list that the line editor shows: names, as far as they are new, behind what was
// typed, and descriptions in a column of their own. All that they have in common is what was typed,
// so the line editor inserts nothing.
Fields BashList(const BashLine& line, const Completion& completion, size_t columns) {
    const size_t typed = line.words.back().size() - completion.stem.size();
    Fields entries;
    size_t widest = 0;
    for (const CompletionCandidate& candidate : completion.candidates) {
        entries.push_back(ShowControlCharacters(line.replaced) +
                          ShowControlCharacters(candidate.text.substr(typed)));
        widest = std::max(widest, CountCharacters(entries.back()));
    }
    for (size_t i = 0; i < entries.size(); ++i) {
        const std::string& description = completion.candidates[i].description;
        if (!description.empty()) {
            entries[i].append(widest - CountCharacters(entries[i]) + 2, ' ');
            entries[i] += "(" + ShowControlCharacters(description) + ")";
        }
        entries[i] = Fit(std::move(entries[i]), columns);
    }
    return entries;
}

Fields AnswerBash(Dispatcher& dispatcher, const Fields& question) {
    if (question.size() < 4) {
        return {};
    }
    const BashLine line = ReadBashLine(question[0], question[1]);
    const Completion completion = CompleteLine(dispatcher, line.words);
    const auto& candidates = completion.candidates;
    Fields answer = {WordFor(completion.files), WordForBlank(completion.endsWord)};
    const auto insert = [&](const std::string& text) {
        answer.push_back(QuoteForBash((completion.stem + text).substr(line.kept), line.quote));
    };
    // These two insert what they are given: "menu-complete" and "insert-completions".
    if (candidates.size() < 2 || question[2] == "37" || question[2] == "42") {
        for (const CompletionCandidate& candidate : candidates) {
            insert(candidate.text);
        }
        return answer;
    }
    const std::string common = CommonBeginning(candidates);
    if (completion.stem.size() + common.size() > line.words.back().size()) {
        answer[1] = WordForBlank(false);
        insert(common);
        return answer;
    }
    constexpr size_t narrowest = 20;
    const size_t columns =
        std::max<size_t>(std::strtoul(question[3].c_str(), nullptr, 10), narrowest);
    std::ranges::move(BashList(line, completion, columns - 1), std::back_inserter(answer));
    return answer;
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

Fields AnswerZsh(Dispatcher& dispatcher, const Fields& question) {
    const Completion completion = CompleteLine(dispatcher, question);
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

Fields AnswerFish(Dispatcher& dispatcher, const Fields& question) {
    const Completion completion = CompleteLine(dispatcher, question);
    Fields answer = {WordFor(completion.files), completion.stem,
                     ShowControlCharacters(completion.message)};
    for (const auto& [text, description] : completion.candidates) {
        if (SuitsFish(text)) {
            answer.push_back(completion.stem + text + "\t" + ShowControlCharacters(description));
        }
    }
    return answer;
}

Fields Answer(Dispatcher& dispatcher, std::string_view shell) {
    const Fields question = ReadQuestion();
    if (shell == "bash") {
        return AnswerBash(dispatcher, question);
    }
    return shell == "zsh" ? AnswerZsh(dispatcher, question) : AnswerFish(dispatcher, question);
}

}  // namespace

void AutoCli_AnswerCompletion(Dispatcher& dispatcher) {
    const char* const variable = std::getenv("ZELMAR_COMPLETE");
    if (!variable) {
        return;
    }
    const std::string shell = variable;
    // What a command starts to find values is to work, not to answer in its turn.
    unsetenv("ZELMAR_COMPLETE");
    SilenceErrors();
    for (const std::string& field : Answer(dispatcher, shell)) {
        std::cout << field << '\0';
    }
    std::exit(EXIT_SUCCESS);
}

}  // namespace AutoCli
