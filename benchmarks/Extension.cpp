// Extension commands by the tool: whole processes, from spawn to wait.

#include <filesystem>
#include <fstream>

#include "Paired.h"

namespace {

namespace fs = std::filesystem;

// Ten commands of four parameters, as the examples have them.
std::string Descriptor(int number) {
    const std::string area = "area" + std::to_string(number);
    std::string text =
        "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<plugin>\n  <version>1.0.0</version>\n"
        "  <namespaces>\n    <namespace path=\"" +
        area +
        "\"><description>Area</description>"
        "</namespace>\n  </namespaces>\n  <commands>\n";
    for (int command = 0; command < 10; ++command) {
        text += "    <command path=\"" + area + ".list" + std::to_string(command) +
                "\">\n      <description>List what there is</description>\n      <input-spec>\n";
        for (const char* name : {"name", "type", "limit", "verbose"}) {
            text +=
                std::string("        <parameter name=\"") + name +
                "\" type=\"string\" required=\"false\">\n          <description>Only those of"
                " this kind</description>\n          <constraint type=\"regex\"><regex>[a-z0-9]+"
                "</regex></constraint>\n        </parameter>\n";
        }
        text +=
            "      </input-spec>\n      <output-spec>\n        <list type=\"structure\">\n"
            "          <structure typeName=\"Item\">\n"
            "            <field name=\"Name\"><string/></field>\n"
            "            <field name=\"Size\"><int/></field>\n"
            "          </structure>\n        </list>\n      </output-spec>\n"
            "      <format-parameters>\n        <formatter>simple</formatter>\n"
            "      </format-parameters>\n"
            "      <execute>echo '&lt;o&gt;&lt;list type=\"structure\"&gt;&lt;structure"
            " typeName=\"Item\"&gt;&lt;field name=\"Name\"&gt;&lt;string&gt;a&lt;/string&gt;&lt;"
            "/field&gt;&lt;field name=\"Size\"&gt;&lt;int&gt;1&lt;/int&gt;&lt;/field&gt;&lt;"
            "/structure&gt;&lt;/list&gt;&lt;/o&gt;'</execute>\n    </command>\n";
    }
    return text + "  </commands>\n</plugin>\n";
}

// A directory of descriptors that goes with its owner.
class Directory {
public:
    explicit Directory(int count)
        : _path(fs::temp_directory_path() /
                ("descriptors-" + std::to_string(getpid()) + "-" + std::to_string(count))) {
        fs::create_directory(_path);
        for (int i = 0; i < count; ++i) {
            std::ofstream(_path / ("area" + std::to_string(i) + ".xml")) << Descriptor(i);
        }
    }
    Directory(const Directory&) = delete;
    Directory& operator=(const Directory&) = delete;
    ~Directory() { fs::remove_all(_path); }

    [[nodiscard]] std::string Path() const { return _path.string(); }

private:
    fs::path _path;
};

// A listing ends with 1, for no command has run.
void List(const Directory& directory) {
    Paired::RunProgram({.words = {KELVASH, "--plugin-dir", directory.Path()}, .status = 1});
}

void CompareCall() {
    const Directory one(1);
    const std::string descriptor = one.Path() + "/area0.xml";
    Paired::Compare(
        "one extension call, from exec to exit", 300,
        {{"kelvash",
          [&] {
              Paired::RunProgram({.words = {KELVASH, "--plugin", descriptor, "area0", "list0"}});
          }},
         {"the same work by hand",
          [&] {
              Paired::RunProgram({.words = {CALL_FLOOR, descriptor}});
          },
          "at most 1.3"}});
}

void CompareStart() {
    const Directory directory(500);
    Paired::Compare("start-up with 500 descriptors of 10 commands", 31,
                    {{"kelvash lists the tree", [&] { List(directory); }},
                     {"libxml2 parses the same files",
                      [&] {
                          Paired::RunProgram({.words = {PARSE_FLOOR, directory.Path()}});
                      },
                      "at most 1"}});
}

void CompareGrowth() {
    const Directory few(10);
    const Directory some(200);
    const Directory many(2000);
    Paired::Compare("start-up, by the descriptor", 11,
                    {{.name = "of 200", .run = [&] { List(some); }, .times = 200},
                     {"of 2000", [&] { List(many); }, "constant", 2000},
                     {"of 10, with what an empty tree costs", [&] { List(few); }, "", 10}});
}

}  // namespace

int main() {
    CompareCall();
    CompareStart();
    CompareGrowth();
}
