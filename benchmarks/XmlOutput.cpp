// Reading a large printed document into values, beside the parser that only makes its tree, and
// beside the same values out of JSON.

#include <zelmar/autocli/extension/XmlOutput.h>

#include <libxml/parser.h>
#include <malloc.h>

#include <nlohmann/json.hpp>

#include "Memory.h"
#include "Paired.h"

namespace {

// 100,000 structs of six fields, as a script prints them.
std::string Document() {
    std::string text = "<output><list type=\"structure\">\n";
    for (int row = 0; row < 100000; ++row) {
        const std::string number = std::to_string(row);
        text +=
            "<structure typeName=\"Filesystem\">"
            "<field name=\"Device\"><string>/dev/mapper/volume-" +
            number +
            "</string></field>"
            "<field name=\"Path\"><string>/srv/data/" +
            number +
            "</string></field>"
            "<field name=\"Readonly\"><bool>" +
            (row % 2 == 0 ? "true" : "false") +
            "</bool></field>"
            "<field name=\"Type\"><string>ext4</string></field>"
            "<field name=\"Size\"><int>" +
            std::to_string(row * 4096L) +
            "</int></field>"
            "<field name=\"Used\"><int>" +
            std::to_string(row * 1024L) +
            "</int></field>"
            "</structure>\n";
    }
    return text + "</list></output>\n";
}

// The same values as JSON.
std::string JsonDocument() {
    std::string text = "[";
    for (int row = 0; row < 100000; ++row) {
        const std::string number = std::to_string(row);
        text += std::string(row == 0 ? "" : ",") + R"({"Device":"/dev/mapper/volume-)" + number +
                R"(","Path":"/srv/data/)" + number + R"(","Readonly":)" +
                (row % 2 == 0 ? "true" : "false") + R"(,"Type":"ext4","Size":)" +
                std::to_string(row * 4096L) + R"(,"Used":)" + std::to_string(row * 1024L) + "}";
    }
    return text + "]";
}

void Parse(const std::string& text) {
    xmlFreeDoc(xmlReadMemory(text.data(), static_cast<int>(text.size()), "STDOUT", nullptr, 0));
}

// In a process of its own, as in a call of the tool: the heap of one that has read many documents
// before tells more about its history than about reading.
void InOwnProcess(const std::function<void()>& run) {
    const pid_t process = fork();
    if (process == 0) {
        run();
        _exit(0);
    }
    waitpid(process, nullptr, 0);
}

}  // namespace

int main() {
    const std::string text = Document();
    std::shared_ptr<MetaObj::MetaObject> value;  // kept: letting go of it is not reading
    const auto read = [&] { value = AutoCli::XmlUtil_ParseXmlOutput(text); };
    const auto parse = [&text] { Parse(text); };
    const std::string json = JsonDocument();
    nlohmann::json theirs;
    const auto readJson = [&] { theirs = nlohmann::json::parse(json); };
    Paired::Compare("reading " + std::to_string(text.size() / 1'000'000) + " MB, 100,000 structs",
                    11,
                    {{"XmlUtil_ParseXmlOutput", [&] { InOwnProcess(read); }},
                     {"xmlReadMemory and xmlFreeDoc", [&] { InOwnProcess(parse); }, "at most 0.6"},
                     {"nlohmann::json::parse, " + std::to_string(json.size() / 1'000'000) + " MB",
                      [&] { InOwnProcess(readJson); }}});

    malloc_trim(0);
    const size_t before = mallinfo2().uordblks;
    const auto peak = static_cast<double>(Memory::GrowthWhile(read));
    const auto values = static_cast<double>(mallinfo2().uordblks - before) / 1024;
    std::printf("peak memory: %.0f MiB, the values alone %.0f MiB: %.2f, at most 1.2\n\n",
                peak / 1024, values / 1024, peak / values);
}
