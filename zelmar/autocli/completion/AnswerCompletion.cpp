#include <zelmar/autocli/Dispatcher.h>
#include <zelmar/autocli/OptionParser.h>
#include <zelmar/autocli/completion/AnswerCompletion.h>
#include <zelmar/autocli/completion/ShellAnswers.h>
#include <zelmar/internal/Split.h>

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <iostream>
#include <string_view>

namespace AutoCli {

namespace {

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

// What cannot be loaded the call will tell; a Tab is silent.
template <class Work>
void Quietly(Work work) {
    try {
        work();
    } catch (...) {
    }
}

void LoadPlugins(Dispatcher& dispatcher, Fields words) {
    words.pop_back();
    OptionParser parser;
    parser.ParseVector(std::move(words));
    for (const std::string& directory : parser.GetDispatcherParameter("plugin-dir")) {
        Quietly([&] { dispatcher.AddExternalDirectory(WithHome(directory)); });
    }
    for (const std::string& path : parser.GetDispatcherParameter("plugin")) {
        Quietly([&] { dispatcher.AddPlugin(WithHome(path)); });
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

// The question is the line up to the cursor, COMP_WORDBREAKS, COMP_TYPE and COLUMNS.
Fields AnswerBash(Dispatcher& dispatcher, const Fields& question) {
    if (question.size() < 4) {
        return {};
    }
    const BashLine line = ReadBashLine(question[0], question[1]);
    // The keys behind these two, "menu-complete" and "insert-completions", insert what they get.
    const bool insertsAll = question[2] == "37" || question[2] == "42";
    constexpr size_t narrowest = 20;
    const size_t columns = std::strtoul(question[3].c_str(), nullptr, 10);
    return AnswerForBash(line, CompleteLine(dispatcher, line.words), insertsAll,
                         std::max(columns, narrowest) - 1);
}

// That of the others is the words.
Fields Answer(Dispatcher& dispatcher, std::string_view shell) {
    const Fields question = ReadQuestion();
    if (shell == "bash") {
        return AnswerBash(dispatcher, question);
    }
    const Completion completion = CompleteLine(dispatcher, question);
    return shell == "zsh" ? AnswerForZsh(completion) : AnswerForFish(completion);
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
