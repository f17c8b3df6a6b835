#include <author/Files.h>
#include <author/Verbs.h>
#include <author/lint/Lint.h>

#include <CLI/CLI.hpp>

#include <algorithm>
#include <iostream>

namespace Author {

namespace {

constexpr int notRunnable = 2;

struct LintOptions {
    std::vector<std::string> paths;
    bool asJson = false;
    bool isStrict = false;
};

// What the step cannot read is told, and does not keep others from being read.
template <class Step>
bool Read(Step step) {
    try {
        step();
        return true;
    } catch (const Unreadable& error) {
        std::cerr << "zelmar: " << error.what() << '\n';
        return false;
    }
}

int RunLint(const LintOptions& options) {
    Lint lint;
    bool isComplete = true;
    std::vector<std::string> files;
    for (const std::string& path : options.paths) {
        isComplete &=
            Read([&] { std::ranges::copy(FilesAt(path, ".xml"), std::back_inserter(files)); });
    }
    for (const std::string& file : files) {
        isComplete &= Read([&] { lint.Add(file); });
    }
    const std::vector<Finding> findings = lint.Finish();
    std::cout << (options.asJson ? AsJson(findings) : AsLines(findings));
    const bool isFound = std::ranges::any_of(findings, [&options](const Finding& finding) {
        return options.isStrict || finding.severity == Severity::Error;
    });
    return !isComplete ? notRunnable : isFound ? EXIT_FAILURE : EXIT_SUCCESS;
}

}  // namespace

void AddLint(CLI::App& program, int& status) {
    auto options = std::make_shared<LintOptions>();
    CLI::App* verb = program.add_subcommand(
        "lint",
        "Find what is wrong with descriptors, as FILE:LINE: error|warning: TEXT [rule]. The status "
        "is 1 when there is an error, and 2 when something cannot be read.");
    verb->add_option("FILE|FOLDER", options->paths,
                     "Descriptors that are loaded together, in this order")
        ->required();
    verb->add_flag("--json", options->asJson, "Print the findings as a JSON array");
    verb->add_flag("--strict", options->isStrict, "Let warnings count as errors");
    verb->callback([options, &status] { status = RunLint(*options); });
}

}  // namespace Author
