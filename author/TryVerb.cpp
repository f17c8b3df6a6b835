#include <author/Plugins.h>
#include <author/Verbs.h>
#include <author/try/Trial.h>

#include <CLI/CLI.hpp>

#include <cstdlib>
#include <stdexcept>

extern char** environ;

namespace Author {

namespace {

struct TryOptions {
    PluginOptions plugins;
    TrialOptions trial;
    bool hasNoLanguage = false;
};

// As cron calls commands: with none of the variables that tell of a language.
void ForgetLanguage() {
    std::vector<std::string> names;
    for (char** variable = environ; variable && *variable; ++variable) {
        const std::string_view text = *variable;
        if (text.starts_with("LANG") || text.starts_with("LC_")) {
            names.emplace_back(text.substr(0, text.find('=')));
        }
    }
    for (const std::string& name : names) {
        unsetenv(name.c_str());
    }
}

int RunTry(const TryOptions& options, const std::vector<std::string>& words) {
    if (words.empty()) {
        throw std::runtime_error("Name a command to try, as kelvash would be given it");
    }
    if (words.front().starts_with("-")) {
        throw std::runtime_error("There is no option " + words.front() +
                                 " ahead of the command; see zelmar try --help");
    }
    if (options.hasNoLanguage) {
        ForgetLanguage();
    }
    AutoCli::CliDispatcher dispatcher;
    LoadPlugins(dispatcher, options.plugins);
    return Trial(dispatcher, options.trial).Run(words) ? EXIT_SUCCESS : EXIT_FAILURE;
}

}  // namespace

void AddTry(CLI::App& program, int& status) {
    auto options = std::make_shared<TryOptions>();
    CLI::App* verb = program.add_subcommand(
        "try",
        "Run one command as kelvash would, and show each step with all that is wrong with it. "
        "Behind"
        " the options stand the words of the command and its options. The status is 1 when"
        " something was found.");
    AddPluginOptions(*verb, options->plugins);
    verb->add_flag("--dry", options->trial.stopsBeforeRun, "Stop before the command runs");
    verb->add_flag("--raw", options->trial.printsBytes,
                   "Print the bytes of the command, and the report on the error stream");
    verb->add_flag("--no-lang", options->hasNoLanguage,
                   "Run without LANG and its kin, as cron does");
    verb->add_option("--output", options->trial.savedOutput,
                     "Run nothing, and judge what was printed into this file")
        ->type_name("FILE");
    verb->prefix_command();
    verb->callback([options, verb, &status] { status = RunTry(*options, verb->remaining()); });
}

}  // namespace Author
