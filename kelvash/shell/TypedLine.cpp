#include "TypedLine.h"

#include <algorithm>
#include <filesystem>

using AutoCli::Completion;
using AutoCli::CompletionCandidate;
using AutoCli::CompletionFiles;
using AutoCli::Dispatcher;
using AutoCli::OptionParser;

namespace KelvashShell {

namespace {

bool IsRefused(const std::filesystem::directory_entry& entry, CompletionFiles kind) {
    std::error_code noError;
    if (entry.is_directory(noError)) {
        return false;
    }
    const std::string ending = entry.path().extension();
    return kind == AutoCli::CompletionFilesDirectories ||
           (kind == AutoCli::CompletionFilesPlugins && ending != ".xml" && ending != ".so");
}

// A line has no way to hold these.
bool CanBeTyped(const CompletionCandidate& candidate) {
    constexpr std::string_view never("\"\n\r\0", 4);
    return candidate.text.find_first_of(never) == std::string::npos;
}

// In bytes, and never within a character of UTF-8.
size_t CommonLength(const std::vector<std::string>& texts) {
    const std::string& first = texts.front();
    size_t length = first.size();
    for (const std::string& text : texts) {
        const auto differing = std::ranges::mismatch(first, text).in1;
        length = std::min(length, static_cast<size_t>(differing - first.begin()));
    }
    const auto isInside = [&](size_t at) {
        return std::ranges::any_of(texts, [at](const std::string& text) {
            return at < text.size() && (static_cast<unsigned char>(text[at]) & 0xC0) == 0x80;
        });
    };
    while (length > 0 && isInside(length)) {
        --length;
    }
    return length;
}

bool IsSecret(const CallSpec::ParameterSpec& parameter, const OptionParser::Option& option) {
    return parameter.IsSecret() && !option.second.empty();
}

// What a command takes; nothing for none, and for one whose declaration is faulty.
std::shared_ptr<CallSpec::InputSpec> SpecOf(AutoCli::CommandSpec* command) {
    try {
        return command ? command->GetInputSpec() : CallSpec::InputSpec::New();
    } catch (...) {
        return CallSpec::InputSpec::New();
    }
}

}  // namespace

std::vector<std::string> WordsOf(const std::string& line) {
    return OptionParser::SplitLine(line);
}

std::vector<std::string> WordsUpToCursor(const std::string& line) {
    // A letter at the cursor keeps the last word, even an empty one, from being dropped.
    auto words = OptionParser::SplitLine(line + 'x');
    if (!words.empty()) {
        words.back().pop_back();
    }
    return words;
}

size_t BeginOfPath(const std::vector<std::string>& words) {
    size_t begin = 0;
    while (begin < words.size() && OptionParser::IsParameter(words[begin])) {
        const bool hasValue = words[begin].find('=') != std::string::npos;
        ++begin;
        if (!hasValue && begin < words.size() && !OptionParser::IsParameter(words[begin])) {
            ++begin;
        }
    }
    return begin;
}

std::shared_ptr<AutoCli::NamespaceNode> FindNode(Dispatcher& dispatcher, const Path& path) {
    try {
        const auto root = dispatcher.GetRootNamespace();
        Path rest = path;
        return path.empty() ? root : root->ResolveNode(rest);
    } catch (...) {
        return nullptr;
    }
}

Keeping KeepingOf(Dispatcher& dispatcher, const std::vector<std::string>& words) {
    OptionParser parser;
    parser.ParseVector(words);
    const auto node = FindNode(dispatcher, parser.GetCommandPath());
    const auto command = std::dynamic_pointer_cast<AutoCli::CommandSpec>(node);
    const auto spec = SpecOf(command.get());
    bool isUnderstood = command || parser.GetCommandParameters().empty();
    for (const OptionParser::Option& option : parser.GetCommandParameters()) {
        const CallSpec::ParameterSpec* const parameter = spec->FindOption(option.first);
        if (!parameter) {
            isUnderstood = false;
        } else if (IsSecret(*parameter, option)) {
            return Keeping::None;
        }
    }
    return isUnderstood && parser.GetParseErrors().empty() ? Keeping::Always : Keeping::Session;
}

std::vector<CompletionCandidate> FilesBehind(const std::string& typed, CompletionFiles kind) {
    std::vector<CompletionCandidate> files;
    const std::string folder = typed.substr(0, typed.rfind('/') + 1);
    const std::string name = typed.substr(folder.size());
    std::error_code error;
    std::filesystem::directory_iterator entries(folder.empty() ? "." : folder, error);
    for (; !error && entries != std::filesystem::directory_iterator(); entries.increment(error)) {
        const std::string entry = entries->path().filename();
        const bool isHidden = entry.starts_with('.') && name.empty();
        if (entry.starts_with(name) && !isHidden && !IsRefused(*entries, kind)) {
            std::error_code noError;
            files.push_back({folder + entry + (entries->is_directory(noError) ? "/" : ""), ""});
        }
    }
    std::ranges::sort(files, {}, &CompletionCandidate::text);
    return files;
}

std::string TextToInsert(const std::string& line, const std::string& typed,
                         const Completion& completion) {
    std::vector<std::string> rests;
    for (const CompletionCandidate& candidate : completion.candidates) {
        if (CanBeTyped(candidate)) {
            rests.push_back(candidate.text.substr(typed.size()));
        }
    }
    if (rests.empty()) {
        return "";
    }
    std::string text = rests.front().substr(0, CommonLength(rests));
    bool inQuotes = std::ranges::count(line, '"') % 2 == 1;
    if (!inQuotes && text.find_first_of(" \t") != std::string::npos) {
        text.insert(0, 1, '"');
        inQuotes = true;
    }
    const bool isWhole = rests.size() == 1 && completion.candidates.size() == 1;
    if (isWhole && completion.endsWord && !text.ends_with('/')) {
        text += inQuotes ? "\" " : " ";
    }
    return text;
}

}  // namespace KelvashShell
