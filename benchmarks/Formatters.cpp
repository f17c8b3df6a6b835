// 100,000 structs of six fields through each formatter into a file, from values that stand ready.

#include <zelmar/zelmar.h>

#include <rapidjson/document.h>
#include <rapidjson/filewritestream.h>
#include <rapidjson/prettywriter.h>
#include <nlohmann/json.hpp>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iomanip>
#include <memory>
#include <sstream>

#include "Memory.h"
#include "Paired.h"
#include "Rows.h"

namespace {

using List = std::shared_ptr<MetaObj::MetaList>;

// The file is written over in place. A new one would have the kernel find and clear pages for all
// of the text, which costs every contender the same and more than most of them take.
std::ofstream Open(const std::string& file) {
    if (!std::filesystem::exists(file)) {
        return std::ofstream(file);
    }
    return std::ofstream(file, std::ios::in | std::ios::out);
}

void Print(const List& list, const std::string& formatter, const std::string& file) {
    static AutoCli::Dispatcher dispatcher;
    [[maybe_unused]] static const bool hasAll = (dispatcher.AddPlugin(FORMATS), true);
    const auto output = AutoCli::CommandOutput::New();
    output->SetRootObject(list);
    AutoCli::FormatParameters parameters;
    parameters.SetFormatter(formatter);
    AutoCli::DisplayContext context;
    std::ofstream stream = Open(file);
    dispatcher.FormatOutput(output, parameters, context, stream);
}

void PrintWithRapidJson(const rapidjson::Document& rows, const std::string& file) {
    Open(file);
    const std::unique_ptr<FILE, int (*)(FILE*)> stream(std::fopen(file.c_str(), "r+"), std::fclose);
    char block[65536];  // as large as the dispatcher's
    rapidjson::FileWriteStream out(stream.get(), block, sizeof block);
    rapidjson::PrettyWriter writer(out);
    writer.SetIndent(' ', 3);
    rows.Accept(writer);
}

std::string Content(const std::string& file) {
    return (std::stringstream() << std::ifstream(file).rdbuf()).str();
}

void CompareJson(const List& list, const std::string& folder) {
    const std::string ours = folder + "/json", rapid = folder + "/rapid", peer = folder + "/peer";
    Print(list, "json", ours);
    const auto nlohmannRows = nlohmann::json::parse(Content(ours));
    rapidjson::Document rapidRows;
    rapidRows.Parse(Content(ours).c_str());
    Paired::Compare(
        "json: 100,000 structs of six fields, to a file", 20,
        {{"json formatter", [&] { Print(list, "json", ours); }},
         {"RapidJSON PrettyWriter", [&] { PrintWithRapidJson(rapidRows, rapid); }, "at most 1.2"},
         {"nlohmann << std::setw(3)", [&] { Open(peer) << std::setw(3) << nlohmannRows; },
          "at most 0.33"},
         {"nlohmann dump(3)", [&] { Open(peer) << nlohmannRows.dump(3); }, "at most 0.33"}});
}

// By the byte, for each gives another text; a copy of the text is what the file alone costs.
void CompareFormatters(const List& list, const std::string& folder) {
    std::vector<Paired::Contender> contenders;
    for (const char* name : {"table", "simple", "json", "xml", "python", "csv", "tsv", "jsonl",
                             "yaml", "markdown", "html"}) {
        const std::string file = folder + "/" + name;
        const auto print = [&list, file, name] { Print(list, name, file); };
        const long growth = Memory::GrowthWhile(print);
        const auto text = std::make_shared<std::string>(Content(file));
        const double megabytes = static_cast<double>(text->size()) / 1e6;
        std::printf("%s: memory grows by %ld KiB for %.1f MB of text\n", name, growth, megabytes);
        const auto copy = [file, text] {
            Open(file).write(text->data(), static_cast<std::streamsize>(text->size()));
        };
        contenders.push_back({name, print, contenders.empty() ? "" : "at least 1", megabytes});
        contenders.push_back({"  std::ostream::write of its text", copy, "", megabytes});
    }
    std::printf("\n");
    Paired::Compare("all formatters, time for one MB of text", 20, contenders);
}

}  // namespace

int main() {
    const auto folder = std::filesystem::temp_directory_path() / "zelmar-formatters-benchmark";
    std::filesystem::create_directory(folder);
    const List list = Rows::Make(100'000);
    CompareFormatters(list, folder);  // first: what the peers leave behind would hide growth
    CompareJson(list, folder);
    std::filesystem::remove_all(folder);
}
