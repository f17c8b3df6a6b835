#include <author/test/Guarded.h>
#include <author/test/Session.h>

#include <unistd.h>

#include <clocale>
#include <cwchar>
#include <filesystem>
#include <fstream>
#include <optional>

namespace Author {

namespace {

constexpr std::streamsize largestText = 4 * 1024 * 1024;

// Keeps the status for the command behind, which may ask for it.
constexpr const char* keepStatus =
    "keep_status() { set -- \"$1\" $?; echo \"$2\" >\"$1\"; return \"$2\"; }\n";

std::string Quoted(const std::string& text) {
    std::string quoted = "'";
    for (const char character : text) {
        quoted += character == '\'' ? std::string("'\\''") : std::string(1, character);
    }
    return quoted + "'";
}

// The steps of a page as a script. Files of its own stand in `folder`; each name ends in the line
// of a command or the number of a step.
std::string Script(const Page& page, const std::string& folder) {
    std::string script = keepStatus;
    for (size_t i = 0; i < page.steps.size(); ++i) {
        if (const auto* file = std::get_if<PageFile>(&page.steps[i])) {
            const std::string copy = folder + "/file-" + std::to_string(i);
            std::ofstream(copy, std::ios::binary) << file->text;
            script += "install -D -m " + Quoted(file->mode) + " " + Quoted(copy) + " " +
                      Quoted(file->name) + "\n";
        } else {
            const auto& command = std::get<PageCommand>(page.steps[i]);
            const std::string end = "-" + std::to_string(command.line);
            script += "{ " + command.text + "} >" + Quoted(folder + "/out" + end) + " 2>" +
                      (command.isExact ? Quoted(folder + "/err" + end) : "&1") + "; keep_status " +
                      Quoted(folder + "/status" + end) + "\n";
        }
    }
    return script;
}

int BecomeShell(const std::string& script, std::vector<std::string> environment) {
    std::vector<char*> variables;
    for (std::string& variable : environment) {
        variables.push_back(variable.data());
    }
    variables.push_back(nullptr);
    const char* const arguments[] = {"/bin/sh", script.c_str(), nullptr};
    execve("/bin/sh", const_cast<char* const*>(arguments), variables.data());
    return EXIT_FAILURE;
}

// With \xHH for each byte that is no text.
std::string ShowBytes(const std::string& text) {
    const locale_t locale = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
    const locale_t before = uselocale(locale);
    std::string shown;
    for (size_t i = 0; i < text.size();) {
        mbstate_t state{};
        size_t size = mbrtowc(nullptr, text.data() + i, text.size() - i, &state);
        if (size == 0 || size > text.size()) {
            constexpr std::string_view digits = "0123456789abcdef";
            const auto byte = static_cast<unsigned char>(text[i]);
            shown += {'\\', 'x', digits[byte / 16], digits[byte % 16]};
            size = 1;
        } else {
            shown.append(text, i, size);
        }
        i += size;
    }
    uselocale(before);
    freelocale(locale);
    return shown;
}

// What a command printed, in lines.
std::string TextOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    std::string text(largestText, '\0');
    file.read(text.data(), largestText);
    text.resize(static_cast<size_t>(file.gcount()));
    text = ShowBytes(text);
    if (!text.empty() && text.back() != '\n') {
        text += "(no line feed)\n";
    }
    return text + (file ? "(more than 4 MiB)\n" : "");
}

// Nothing when the command did not end.
std::optional<std::string> Printed(const PageCommand& command, const std::string& folder) {
    const std::string end = "-" + std::to_string(command.line);
    std::string status;
    std::ifstream file(folder + "/status" + end);
    if (!std::getline(file, status)) {
        return std::nullopt;
    }
    std::string text = TextOf(folder + "/out" + end);
    if (command.isExact) {
        for (const std::string& line : LinesOf(TextOf(folder + "/err" + end))) {
            text += "2> " + line;
        }
        text += status == "0" ? "" : "[status " + status + "]\n";
    }
    return text;
}

}  // namespace

PageResult RunPage(const Page& page, const SessionOptions& options) {
    const TemporaryFolder folder;
    const std::string work = folder.GetPath() + "/work";
    std::filesystem::create_directory(work);
    for (const auto& [name, target] : options.links) {
        std::filesystem::create_symlink(std::filesystem::absolute(target), work + "/" + name);
    }
    const std::string script = folder.GetPath() + "/script";
    std::ofstream(script, std::ios::binary) << Script(page, folder.GetPath());
    std::vector<std::string> environment = options.environment;
    environment.push_back("HOME=" + work);
    PageResult result;
    result.isInTime =
        RunGuarded(work, options.limit, [&] { return BecomeShell(script, environment); });
    for (const PageStep& step : page.steps) {
        const auto* command = std::get_if<PageCommand>(&step);
        const auto printed = command ? Printed(*command, folder.GetPath()) : "";
        if (!printed) {
            result.unended = command;
            break;
        }
        if (command && !Matches(LinesOf(command->shown), LinesOf(*printed))) {
            result.differences.push_back({command, *printed});
        }
    }
    return result;
}

}  // namespace Author
