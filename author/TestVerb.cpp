#include <author/Files.h>
#include <author/Verbs.h>
#include <author/test/Correction.h>
#include <author/test/Guarded.h>
#include <author/test/Probe.h>

#include <CLI/CLI.hpp>

#include <algorithm>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <iostream>

namespace Author {

namespace {

constexpr int notRunnable = 2;

constexpr const char* description =
    R"text(Run the console blocks of pages and compare what they give with what the page shows. The status is
1 when a page shows something else, and 2 when something cannot be run.

A page is Markdown, and one session of sh in an empty folder with an empty standard input. Its fenced
blocks are taken in order:

  ```xml file=hello.xml         is written to this file; any language will do
  ```sh file=hello.sh mode=755  the same, with these permissions
  ```console                    a line "$ ..." is a command, lines "> ..." below it go on with it,
                                and the lines below are what it prints on both streams; a line
                                "..." stands for any lines
  ```console exact              the same with the streams apart: standard output, then the error
                                stream with "2> " ahead of each line, then "[status N]" unless it
                                is 0
  ```text                       is an illustration and left alone

A byte that is no UTF-8 is shown as \xHH, and text without a line feed at its end with "(no line
feed)" behind it. The commands find PATH, HOME (their folder), PAGES (the folder of the page) and
what options give, but nothing else of the environment.)text";

struct TestOptions {
    std::vector<std::string> paths;
    std::string programs;
    std::vector<std::string> links;
    std::vector<std::string> environment;
    std::vector<std::string> plugins;
    unsigned limit = 60;
    bool isUpdate = false;
    bool isProbe = false;
    bool mayChange = false;
};

std::pair<std::string, std::string> Split(const std::string& text) {
    const size_t place = text.find('=');
    if (place == 0 || place == std::string::npos) {
        throw std::invalid_argument("'" + text + "' is not NAME=TARGET");
    }
    return {text.substr(0, place), text.substr(place + 1)};
}

// Each NAME=VALUE; a bare name hands on the caller's, if there is one.
std::vector<std::string> Variables(const std::vector<std::string>& given) {
    std::vector<std::string> variables;
    for (const std::string& variable : given) {
        const char* value = std::getenv(variable.c_str());
        if (variable.find('=') != std::string::npos) {
            variables.push_back(variable);
        } else if (value) {
            variables.push_back(variable + "=" + value);
        }
    }
    return variables;
}

SessionOptions SessionFor(const TestOptions& options) {
    SessionOptions session;
    session.limit = std::chrono::seconds(options.limit);
    std::ranges::transform(options.links, std::back_inserter(session.links), Split);
    session.environment = Variables(options.environment);
    const char* path = std::getenv("PATH");
    session.environment.push_back("PATH=" + options.programs +
                                  (options.programs.empty() ? "" : ":") +
                                  (path ? path : "/usr/bin:/bin"));
    return session;
}

// True when the page shows what happens, which an update may have seen to.
bool RunOne(const Page& page, SessionOptions session, bool isUpdate) {
    session.environment.push_back("PAGES=" +
                                  std::filesystem::absolute(page.path).parent_path().string());
    const PageResult result = RunPage(page, session);
    ShowResult(page, result);
    if (isUpdate) {
        Update(page, result);
    }
    return !result.unended && (isUpdate || result.differences.empty());
}

// Ends as whoever sent the signal expects.
[[noreturn]] void EndBy(const Interrupted& interrupt, const std::string& path) {
    std::cout.flush();
    std::cerr << "zelmar: " << interrupt.what() << " in " << path
              << "; all that it started has ended\n";
    std::signal(interrupt.signal, SIG_DFL);
    std::raise(interrupt.signal);
    std::abort();
}

struct Totals {
    size_t pages = 0;
    size_t commands = 0;
    size_t wrong = 0;  // pages
    bool isComplete = true;
};

// What cannot be run is told, and does not keep others from being run.
template <class Step>
void Try(Totals& totals, Step step) {
    try {
        step();
    } catch (const Unreadable& error) {
        std::cerr << "zelmar: " << error.what() << '\n';
        totals.isComplete = false;
    } catch (const FaultyPage& error) {
        std::cerr << error.what() << '\n';
        totals.isComplete = false;
    }
}

void RunFile(const std::string& path, const SessionOptions& session, bool isUpdate,
             Totals& totals) {
    const Page page = ReadPage(path);
    const auto commands = std::ranges::count_if(
        page.steps, [](const PageStep& step) { return std::holds_alternative<PageCommand>(step); });
    ++totals.pages;
    totals.commands += static_cast<size_t>(commands);
    try {
        totals.wrong += commands == 0 || RunOne(page, session, isUpdate) ? 0 : 1;
    } catch (const Interrupted& interrupt) {
        EndBy(interrupt, path);
    }
}

int RunTest(const TestOptions& options) {
    const SessionOptions session = SessionFor(options);
    Totals totals;
    std::vector<std::string> files;
    for (const std::string& path : options.paths) {
        Try(totals, [&] { std::ranges::copy(FilesAt(path, ".md"), std::back_inserter(files)); });
    }
    for (const std::string& file : files) {
        Try(totals, [&] { RunFile(file, session, options.isUpdate, totals); });
    }
    std::cout << "Pages: " << totals.pages << ", commands: " << totals.commands
              << ", pages that are wrong: " << totals.wrong << '\n';
    return !totals.isComplete ? notRunnable : totals.wrong ? EXIT_FAILURE : EXIT_SUCCESS;
}

int RunProbe(const TestOptions& options) {
    try {
        const std::chrono::seconds limit(options.limit);
        return Probe({options.plugins, Variables(options.environment), limit, options.mayChange})
                   ? EXIT_SUCCESS
                   : EXIT_FAILURE;
    } catch (const Interrupted& interrupt) {
        EndBy(interrupt, "a call");
    }
}

}  // namespace

void AddTest(CLI::App& program, int& status) {
    auto options = std::make_shared<TestOptions>();
    CLI::App* verb = program.add_subcommand("test", description);
    CLI::Option* paths = verb->add_option("FILE|FOLDER", options->paths,
                                          "Pages, or folders with pages that end in .md");
    CLI::Option* probe =
        verb->add_flag(
                "--probe", options->isProbe,
                "Without pages: call each command of the plugins with the values at the "
                "ends of what its parameters take, with hostile ones and in poor "
                "environments, and tell what breaks, hangs, runs a value or gives a document "
                "of the wrong shape")
            ->excludes(paths);
    verb->add_option("--plugin", options->plugins, "What to probe, as often as wanted")
        ->allow_extra_args(false)
        ->needs(probe);
    verb->add_flag("--yes", options->mayChange,
                   "Probe commands as well that do not promise by their meta-data, read-only, to "
                   "change nothing")
        ->needs(probe);
    verb->add_flag("--update", options->isUpdate,
                   "Write what was printed into the pages, to be read before it is kept")
        ->envname("UPDATE_GOLDEN");
    verb->add_option("--time-limit", options->limit, "Seconds for a page, or a call of a probe")
        ->check(CLI::Range(1U, 86400U))
        ->capture_default_str();
    verb->add_option("--path", options->programs, "A folder that comes first on the PATH");
    verb->add_option("--link", options->links,
                     "A link in the folder of each page, NAME=TARGET, as often as wanted")
        ->allow_extra_args(false);
    verb->add_option("--env", options->environment,
                     "A variable, NAME=VALUE, or NAME to hand on the caller's, as often as wanted")
        ->allow_extra_args(false);
    verb->callback([options, &status] {
        const bool isGiven = options->isProbe ? !options->plugins.empty() : !options->paths.empty();
        if (!isGiven) {
            throw CLI::RequiredError(options->isProbe ? "--plugin" : "FILE|FOLDER");
        }
        status = options->isProbe ? RunProbe(*options) : RunTest(*options);
    });
}

}  // namespace Author
