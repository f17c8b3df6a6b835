// Reading a large printed document into values, beside the parser alone.

#include <zelmar/autocli/extension/XmlOutput.h>

#include <libxml/parser.h>
#include <malloc.h>

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
    Paired::Compare("reading " + std::to_string(text.size() / 1'000'000) + " MB, 100,000 structs",
                    11,
                    {{"XmlUtil_ParseXmlOutput", [&] { InOwnProcess(read); }},
                     {"xmlReadMemory and xmlFreeDoc", [&] { InOwnProcess(parse); }, "at most 2"}});

    const auto theirs = static_cast<double>(Memory::GrowthWhile(parse));
    malloc_trim(0);
    const auto ours = static_cast<double>(Memory::GrowthWhile(read));
    std::printf("peak memory: %.0f MiB, parser alone %.0f MiB: %.2f, at most 1.5\n\n", ours / 1024,
                theirs / 1024, ours / theirs);
}
