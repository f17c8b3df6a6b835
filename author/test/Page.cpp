#include <author/Files.h>
#include <author/test/Page.h>

#include <algorithm>
#include <iterator>
#include <sstream>

namespace Author {

namespace {

constexpr std::string_view prompt = "$ ";
constexpr std::string_view continuation = "> ";

[[noreturn]] void Fail(const Page& page, size_t index, const std::string& text) {
    throw FaultyPage(page.path + ":" + std::to_string(index + 1) + ": error: " + text);
}

// A fence is a run of at least three backquotes, which a run that is as long closes.
size_t FenceLength(std::string_view line) {
    const size_t length = std::min(line.find_first_not_of('`'), line.size());
    return length >= 3 && line.find('`', length) == std::string_view::npos ? length : 0;
}

bool Closes(std::string_view line, size_t length) {
    const size_t size = line.size() - (line.ends_with('\n') ? 1 : 0);
    return size >= length && line.find_first_not_of('`') >= size;
}

std::vector<std::string> WordsOf(const std::string& line) {
    std::istringstream stream(line);
    return {std::istream_iterator<std::string>(stream), {}};
}

// The lines of a block stand at `begin` to `end`; the first line of all has the index 0.
struct Block {
    std::vector<std::string> words;
    size_t begin = 0;
    size_t end = 0;
};

void AddFile(Page& page, const Block& block) {
    PageFile file{block.words[1].substr(5), "644", {}};
    if (block.words.size() == 3 && block.words[2].starts_with("mode=")) {
        file.mode = block.words[2].substr(5);
    } else if (block.words.size() > 2) {
        Fail(page, block.begin - 1, "behind file=NAME there is mode=MODE alone");
    }
    for (size_t i = block.begin; i < block.end; ++i) {
        file.text += page.lines[i];
    }
    page.steps.emplace_back(std::move(file));
}

void AddCommands(Page& page, const Block& block) {
    std::vector<PageCommand> commands;
    for (size_t i = block.begin; i < block.end; ++i) {
        const std::string& line = page.lines[i];
        if (line.starts_with(prompt)) {
            commands.push_back({i + 1, line.substr(2), i + 2, {}, block.words.size() == 2});
        } else if (commands.empty()) {
            Fail(page, i, "a console block begins with a command, as in: $ ls");
        } else if (line.starts_with(continuation) && commands.back().shown.empty()) {
            commands.back().text += line.substr(2);
            commands.back().shownLine = i + 2;
        } else {
            commands.back().shown += line;
        }
    }
    std::ranges::move(commands, std::back_inserter(page.steps));
}

void AddBlock(Page& page, const Block& block) {
    const auto& words = block.words;
    if (words.size() > 1 && words[1].starts_with("file=") && words[1].size() > 5) {
        AddFile(page, block);
    } else if (words == std::vector<std::string>{"console"} ||
               words == std::vector<std::string>{"console", "exact"}) {
        AddCommands(page, block);
    } else if (words != std::vector<std::string>{"text"}) {
        Fail(page, block.begin - 1,
             "a block is a file (```LANGUAGE file=NAME), or ```console, ```console exact or "
             "```text");
    }
}

}  // namespace

std::vector<std::string> LinesOf(std::string_view text) {
    std::vector<std::string> lines;
    while (!text.empty()) {
        const size_t size = std::min(text.find('\n'), text.size() - 1) + 1;
        lines.emplace_back(text.substr(0, size));
        text.remove_prefix(size);
    }
    return lines;
}

Page ReadPage(const std::string& path) {
    const std::string text = ReadFile(path);
    Page page{path, LinesOf(text), {}};
    if (text.find('\0') != std::string::npos) {
        Fail(page, 0, "a page is text in UTF-8, and there are NUL bytes in it");
    }
    for (size_t i = 0; i < page.lines.size(); ++i) {
        const size_t length = FenceLength(page.lines[i]);
        if (length == 0) {
            continue;
        }
        Block block{WordsOf(page.lines[i].substr(length)), i + 1, i + 1};
        const auto closes = [length](const std::string& line) { return Closes(line, length); };
        block.end =
            static_cast<size_t>(std::find_if(page.lines.begin() + static_cast<long>(block.begin),
                                             page.lines.end(), closes) -
                                page.lines.begin());
        if (block.end == page.lines.size()) {
            Fail(page, i, "the block is not closed");
        }
        AddBlock(page, block);
        i = block.end;
    }
    return page;
}

// Goes on behind the last "..." with one line more for it whenever the lines do not fit.
bool Matches(const std::vector<std::string>& shown, const std::vector<std::string>& printed) {
    size_t here = 0;
    size_t there = 0;
    size_t behindDots = std::string::npos;
    size_t dotsEnd = 0;
    while (there < printed.size()) {
        if (here < shown.size() && shown[here] == "...\n") {
            behindDots = ++here;
            dotsEnd = there;
        } else if (here < shown.size() && shown[here] == printed[there]) {
            ++here;
            ++there;
        } else if (behindDots != std::string::npos) {
            here = behindDots;
            there = ++dotsEnd;
        } else {
            return false;
        }
    }
    return std::all_of(shown.begin() + static_cast<long>(here), shown.end(),
                       [](const std::string& line) { return line == "...\n"; });
}

}  // namespace Author
