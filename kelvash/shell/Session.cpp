#include "Session.h"

#include <algorithm>
#include <array>
#include <cstdlib>
#include <iostream>

using AutoCli::Completion;
using AutoCli::CompletionCandidate;
using AutoCli::OptionParser;
using MetaObj::MetaList;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace KelvashShell {

namespace {

constexpr size_t mostChoices = 200;  // lines; more would only scroll by

const std::array<CompletionCandidate, 3> ownCommands = {{
    {"exit", "Leave the shell"},
    {"quit", "Leave the shell"},
    {"use", "Stand in a namespace, or in the root again"},
}};

constexpr const char* helpText = R"( In this shell: 
       <Tab>                           Complete the word, or list what can follow
       ?                               List what can follow
       use <namespace>                 Stand in a namespace; use alone: in the root again
       exit, quit, Ctrl-D              Leave
       Ctrl-C                          Give up the line, or end the script that runs

)";

void PrintError(const std::string& message) {
    std::cout.flush();
    std::cerr << "Errors: \n" << AutoCli::AutoCli_ErrorText(message) << std::endl;
}

std::shared_ptr<MetaStruct> ShapeOfChoice() {
    auto shape = MetaStruct::New("Choice");
    shape->SetField("Name", "");
    shape->SetField("Description", "");
    return shape;
}

}  // namespace

Session::Session(AutoCli::CliDispatcher& dispatcher)
    : _dispatcher(dispatcher), _editor([this](const std::string& line) { return Propose(line); }) {
    for (const std::string& line : _history.Load()) {
        _editor.Remember(line);
    }
    if (!_history.Complaint().empty()) {
        std::cerr << _history.Complaint() << std::endl;
    }
}

int Session::Run() {
    bool goesOn = true;
    while (goesOn) {
        const auto line = _editor.Read(Prompt());
        if (!line) {
            std::cout << std::endl;
        }
        goesOn = line && RunLine(*line);
    }
    return _status;
}

std::string Session::Prompt() const {
    std::string prompt = "kelvash";
    for (const std::string& name : _namespace) {
        prompt += " " + name;
    }
    return prompt + (_status == 0 ? "" : " [" + std::to_string(_status) + "]") + "> ";
}

// False for a line that leaves.
bool Session::RunLine(const std::string& line) {
    std::vector<std::string> words = WordsOf(line);
    if (words.empty()) {
        return true;
    }
    Remember(line, words);
    const std::string first = words.front();
    if (first == "exit" || first == "quit") {
        return false;
    }
    if (first == "use") {
        Use({words.begin() + 1, words.end()});
    } else {
        RunCommand(InNamespace(std::move(words)));
    }
    return true;
}

void Session::RunCommand(std::vector<std::string> words) {
    OptionParser parser;
    parser.ParseVector(std::move(words));
    _status = _dispatcher.Run(parser, false);
    if (parser.HasDispatcherParameter("h") || parser.HasDispatcherParameter("help")) {
        std::cout << helpText;
    }
    if (!std::cout.flush()) {
        std::cout.clear();
        PrintError("Unable to write to standard output");
        _status = EXIT_FAILURE;
    }
}

void Session::Use(const std::vector<std::string>& names) {
    const Path path = names.empty() ? Path() : Absolute(names);
    const auto node = FindNode(_dispatcher, path);
    if (path.empty() || (node && node->GetType() == AutoCli::NodeTypeNamespace)) {
        _namespace = path;
        _status = EXIT_SUCCESS;
    } else {
        PrintError("There is no namespace '" + names.back() + "' to use");
        _status = EXIT_FAILURE;
    }
}

void Session::Remember(const std::string& line, const std::vector<std::string>& words) {
    const bool isOwn = std::ranges::find(ownCommands, words.front(), &CompletionCandidate::text) !=
                       ownCommands.end();
    const Keeping keeping = isOwn ? Keeping::Always : KeepingOf(_dispatcher, InNamespace(words));
    if (keeping != Keeping::None) {
        _editor.Remember(line);
    }
    if (keeping == Keeping::Always) {
        _history.Append(line);
    }
}

// A name that is not found in the namespace may be one of the root.
Path Session::Absolute(const std::vector<std::string>& names) const {
    Path path = _namespace;
    path.push_back(names.front());
    if (!FindNode(_dispatcher, path) && FindNode(_dispatcher, {names.front()})) {
        return {names.begin(), names.end()};
    }
    path.insert(path.end(), names.begin() + 1, names.end());
    return path;
}

std::vector<std::string> Session::InNamespace(std::vector<std::string> words) const {
    const auto begin = words.begin() + static_cast<long>(BeginOfPath(words));
    const auto end = std::find_if(begin, words.end(), OptionParser::IsParameter);
    const Path path = begin == end ? _namespace : Absolute({begin, end});
    words.insert(words.erase(begin, end), path.begin(), path.end());
    return words;
}

LineEditor::Proposal Session::Propose(const std::string& line) const {
    std::vector<std::string> words = WordsUpToCursor(line);
    if (words.empty()) {
        return {};
    }
    const std::string last = words.back();
    auto completion = std::make_shared<Completion>(Complete(std::move(words)));
    const std::string typed = last.substr(completion->stem.size());
    if (completion->files != AutoCli::CompletionFilesNone) {
        for (CompletionCandidate& file : FilesBehind(typed, completion->files)) {
            completion->candidates.push_back(std::move(file));
        }
    }
    LineEditor::Proposal proposal;
    proposal.insertion = TextToInsert(line, typed, *completion);
    if (!completion->candidates.empty() || !completion->message.empty()) {
        proposal.print = [this, completion] { PrintChoice(*completion); };
    }
    return proposal;
}

Completion Session::Complete(std::vector<std::string> words) const {
    if (words.front() == "use" && words.size() > 1) {
        return CompleteUse(words);
    }
    const bool isFirst = words.size() == 1;
    const std::string last = words.back();
    const size_t begin = BeginOfPath(words);
    if (begin + 1 < words.size() || (begin + 1 == words.size() && !last.starts_with('-'))) {
        words.pop_back();
        words = InNamespace(std::move(words));
        words.push_back(last);
    }
    Completion completion = AutoCli::Completer(_dispatcher).Complete(std::move(words));
    if (isFirst) {
        std::ranges::copy_if(
            ownCommands, std::back_inserter(completion.candidates),
            [&last](const CompletionCandidate& own) { return own.text.starts_with(last); });
    }
    return completion;
}

Completion Session::CompleteUse(const std::vector<std::string>& words) const {
    const std::vector<std::string> names(words.begin() + 1, words.end() - 1);
    const Path path = names.empty() ? _namespace : Absolute(names);
    const auto node = FindNode(_dispatcher, path);
    Completion completion;
    if (!node) {
        return completion;
    }
    for (const auto& child : node->GetNamespaceNodes()) {
        if (child->GetType() == AutoCli::NodeTypeNamespace &&
            child->GetName().starts_with(words.back())) {
            completion.candidates.push_back({child->GetName(), child->GetDescription()});
        }
    }
    return completion;
}

void Session::PrintChoice(const Completion& completion) const {
    const auto shape = ShapeOfChoice();
    auto list = MetaList::New(MetaType::Struct, shape);
    const auto& candidates = completion.candidates;
    for (size_t i = 0; i < std::min(candidates.size(), mostChoices); ++i) {
        auto row = MetaStruct::New(shape);
        row->SetField("Name", completion.stem + candidates[i].text);
        row->SetField("Description", candidates[i].description);
        list->Add(row);
    }
    auto output = CallSpec::Output::New();
    output->SetRootObject(list);
    AutoCli::FormatParameters format;
    format.SetFormatter("table");
    const bool isDescribed = std::ranges::any_of(
        candidates, [](const auto& candidate) { return !candidate.description.empty(); });
    format.SetParameter("fields", isDescribed ? "Name,Description" : "Name");
    format.SetParameter("show-header", "false");
    format.SetParameter("wrap-last", "true");
    AutoCli::DisplayContext context;
    _dispatcher.GetDisplayContext(context);
    _dispatcher.FormatOutput(output, format, context, std::cout);
    if (candidates.size() > mostChoices) {
        std::cout << "and " << candidates.size() - mostChoices << " more" << std::endl;
    }
    if (!completion.message.empty()) {
        std::cout << AutoCli::AutoCli_ShowControls(completion.message) << std::endl;
    }
}

}  // namespace KelvashShell
