#include <author/test/Correction.h>
#include <author/test/Guarded.h>

#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iostream>

namespace Author {

namespace {

namespace fs = std::filesystem;

// The page with what was printed in it.
std::string Corrected(const Page& page, const PageResult& result) {
    std::string text;
    size_t done = 0;
    const auto keepUpTo = [&](size_t end) {
        for (; done < end; ++done) {
            text += page.lines[done];
        }
    };
    for (const auto& [command, printed] : result.differences) {
        keepUpTo(command->shownLine - 1);
        text += printed;
        done += LinesOf(command->shown).size();
    }
    keepUpTo(page.lines.size());
    return text;
}

void Write(const std::string& path, const std::string& text) {
    if (!(std::ofstream(path, std::ios::binary) << text).flush()) {
        throw std::runtime_error("Unable to write " + path);
    }
}

void CheckFits(const Page& page, const Difference& difference) {
    const auto lines = LinesOf(difference.printed);
    const auto unfit = std::ranges::find_if(lines, [&](const std::string& line) {
        return line.starts_with("$ ") || line.starts_with("```") ||
               (&line == lines.data() && line.starts_with("> "));
    });
    if (unfit != lines.end()) {
        throw FaultyPage(page.path + ":" + std::to_string(difference.command->line) +
                         ": error: a page cannot show this line that is printed; let the command "
                         "put something in front of it: " +
                         unfit->substr(0, unfit->size() - 1));
    }
}

}  // namespace

void ShowResult(const Page& page, const PageResult& result) {
    if (result.unended) {
        std::cout << page.path << ':' << result.unended->line << ": error: "
                  << (result.isInTime ? "the session ended with this command, ahead of the others"
                                      : "the time was over when this command ran")
                  << ": $ " << result.unended->text;
    }
    if (result.differences.empty()) {
        return;
    }
    for (const Difference& difference : result.differences) {
        std::cout << page.path << ':' << difference.command->line
                  << ": error: this is not what the command prints: $ "
                  << LinesOf(difference.command->text).front();
    }
    const TemporaryFolder folder;
    const std::string corrected = folder.GetPath() + "/corrected";
    Write(corrected, Corrected(page, result));
    const std::string shown = fs::absolute(page.path);
    const std::string label = page.path + " (as it is)";
    RunGuarded(folder.GetPath(), std::chrono::minutes(1), [&] {
        execlp("diff", "diff", "-u", "--label", page.path.c_str(), "--label", label.c_str(),
               shown.c_str(), corrected.c_str(), nullptr);
        std::perror("zelmar: Unable to run diff");
        return EXIT_FAILURE;
    });
}

// The page is replaced as a whole: whoever reads it meanwhile finds one of the two.
void Update(const Page& page, const PageResult& result) {
    for (const Difference& difference : result.differences) {
        CheckFits(page, difference);
    }
    if (!result.differences.empty()) {
        const fs::path path = fs::canonical(page.path);
        const fs::path next = path.string() + ".new";
        Write(next, Corrected(page, result));
        fs::permissions(next, fs::status(path).permissions());
        fs::rename(next, path);
    }
}

}  // namespace Author
