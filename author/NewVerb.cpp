#include <author/Verbs.h>
#include <author/lint/Lint.h>
#include <author/new/Texts.h>
#include <author/test/Correction.h>
#include <author/test/Guarded.h>

#include <fcntl.h>
#include <unistd.h>

#include <CLI/CLI.hpp>

#include <algorithm>
#include <array>
#include <cstring>
#include <filesystem>
#include <iostream>
#include <regex>

namespace Author {

namespace {

namespace fs = std::filesystem;

struct NewOptions {
    std::string path;
    std::string language = "sh";
    std::vector<std::string> parameters;
    std::string result;
};

struct Language {
    const char* name;
    std::string (*script)(const NewCommand& command);
    const Helper& helper;
};

constexpr std::array<Language, 3> languages = {{
    {"sh", ShScriptOf, shHelper},
    {"python", PythonScriptOf, pythonHelper},
    {"perl", PerlScriptOf, perlHelper},
}};

struct NewFile {
    std::string name;
    std::string text;
    mode_t mode = 0666;
};

NewCommand CommandOf(const NewOptions& options) {
    static const std::regex path(
        R"([a-z][a-z0-9]*([A-Z][a-z0-9]+)*(\.[a-z][a-z0-9]*([A-Z][a-z0-9]+)*)+)");
    if (!std::regex_match(options.path, path)) {
        throw std::invalid_argument("'" + options.path +
                                    "' is no path; write namespaces and a command in small letters "
                                    "with dots between them, as in backup.list");
    }
    NewCommand command;
    std::istringstream stream(options.path);
    for (std::string name; std::getline(stream, name, '.');) {
        command.path.push_back(name);
    }
    command.language = options.language;
    command.script = fs::current_path() / command.Path("-");
    if (!std::regex_match(command.script, std::regex(R"([A-Za-z0-9_./+,@-]+)"))) {
        throw std::invalid_argument("'" + command.script +
                                    "' is no name for a script: it needs quotes in a shell");
    }
    const bool isExample = options.parameters.empty() && options.result.empty();
    const std::vector<std::string> example = {"name?:string", "limit?:int=1..100"};
    std::ranges::transform(isExample ? example : options.parameters,
                           std::back_inserter(command.parameters), ReadParameter);
    command.result =
        ReadResult(options.result.empty() ? "Item[] Name:string Size:int" : options.result);
    return command;
}

// Tells what a descriptor may not say, ahead of the script, which is not there yet.
void CheckDescriptor(const std::string& descriptor) {
    const TemporaryFolder folder;
    const std::string file = folder.GetPath() + "/command.xml";
    std::ofstream(file) << descriptor;
    Lint lint;
    lint.Add(file);
    for (const Finding& finding : lint.Finish()) {
        if (finding.rule != "program") {
            throw std::invalid_argument("This cannot be declared: " + finding.text);
        }
    }
}

void Create(const NewFile& file) {
    const int descriptor =
        open(file.name.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, file.mode);
    if (descriptor < 0 || close(descriptor) != 0 ||
        !(std::ofstream(file.name, std::ios::binary) << file.text).flush()) {
        throw std::runtime_error("Unable to write " + file.name + ": " + std::strerror(errno));
    }
    std::cout << file.name << '\n';
}

// Writes down what the new command prints, by the kelvash that belongs to this program.
void FillPage(const std::string& name) {
    SessionOptions session;
    session.limit = std::chrono::minutes(1);
    const char* path = std::getenv("PATH");
    session.environment = {"PATH=" + fs::read_symlink("/proc/self/exe").parent_path().string() +
                               ":" + (path ? path : "/usr/bin:/bin"),
                           "PAGES=" + fs::current_path().string()};
    const Page page = ReadPage(name);
    Update(page, RunPage(page, session));
}

int RunNew(const NewOptions& options) {
    const NewCommand command = CommandOf(options);
    const Language& language = *std::ranges::find(languages, options.language, &Language::name);
    const std::string name = command.Path("-");
    const std::vector<NewFile> files = {{name + ".xml", DescriptorOf(command)},
                                        {name, language.script(command), 0777},
                                        {name + ".md", PageOf(command)}};
    CheckDescriptor(files[0].text);
    for (const NewFile& file : files) {
        if (fs::exists(fs::symlink_status(file.name))) {
            throw std::runtime_error(file.name + " exists; nothing was written");
        }
    }
    std::ranges::for_each(files, Create);
    if (!fs::exists(fs::symlink_status(language.helper.name))) {
        Create({language.helper.name, std::string(language.helper.text)});
    }
    FillPage(name + ".md");
    std::cout << "Try it: kelvash --plugin " << name << ".xml " << command.Path(" ")
              << "\nTest it: zelmar test " << name << ".md\n";
    return EXIT_SUCCESS;
}

}  // namespace

void AddNew(CLI::App& program, int& status) {
    auto options = std::make_shared<NewOptions>();
    CLI::App* verb = program.add_subcommand("new",
                                            "Begin a command: a descriptor, a script that prints "
                                            "an example, the helper that it uses and "
                                            "a page that tests it, in this folder. Nothing is "
                                            "overwritten. Without options it is a small "
                                            "example.");
    verb->add_option("PATH", options->path, "Namespaces and command, as in backup.list")
        ->required();
    verb->add_option("--language", options->language, "sh, python or perl")
        ->check(CLI::IsMember({"sh", "python", "perl"}))
        ->capture_default_str();
    verb->add_option("--parameter", options->parameters,
                     "NAME:TYPE, or NAME?:TYPE if it can be left out; TYPE is string, int, "
                     "int=MIN..MAX, bool, flag, string-list, int-list, bool-list, or values: "
                     "full|diff. As often as wanted")
        ->allow_extra_args(false);
    verb->add_option("--result", options->result,
                     "A structure, 'Backup Name:string Size:int', with [] behind the name for a "
                     "list of them, or a plain type: string, int, bool, string[] and so on");
    verb->callback([options, &status] { status = RunNew(*options); });
}

}  // namespace Author
