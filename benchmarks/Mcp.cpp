// Calls through kelvash-mcp, which answers over a pipe, beside the same calls in this process; and
// the listing of a large tree.

#include <zelmar/zelmar.h>

#include <nlohmann/json.hpp>

#include <filesystem>
#include <fstream>

#include "Paired.h"

namespace {

// The server with its two pipes. It ends when its input does.
class Server {
public:
    explicit Server(std::vector<std::string> words) {
        int in[2];
        int out[2];
        if (pipe2(in, O_CLOEXEC) != 0 || pipe2(out, O_CLOEXEC) != 0) {
            throw std::runtime_error("pipe");
        }
        posix_spawn_file_actions_t actions;
        posix_spawn_file_actions_init(&actions);
        posix_spawn_file_actions_adddup2(&actions, in[0], STDIN_FILENO);
        posix_spawn_file_actions_adddup2(&actions, out[1], STDOUT_FILENO);
        std::vector<char*> argv;
        for (std::string& word : words) {
            argv.push_back(word.data());
        }
        argv.push_back(nullptr);
        if (posix_spawn(&_pid, argv[0], &actions, nullptr, argv.data(), environ) != 0) {
            throw std::runtime_error("posix_spawn");
        }
        posix_spawn_file_actions_destroy(&actions);
        close(in[0]);
        close(out[1]);
        _input = in[1];
        _output = fdopen(out[0], "r");
    }
    Server(const Server&) = delete;
    Server& operator=(const Server&) = delete;
    ~Server() {
        close(_input);
        std::fclose(_output);
        std::free(_line);
        waitpid(_pid, nullptr, 0);
    }

    // The line that answers.
    std::string Ask(const std::string& method, const std::string& parameters) {
        const std::string line = R"({"jsonrpc":"2.0","id":1,"method":")" + method +
                                 R"(","params":)" + parameters + "}\n";
        if (write(_input, line.data(), line.size()) != static_cast<ssize_t>(line.size())) {
            throw std::runtime_error("write");
        }
        const ssize_t size = getline(&_line, &_room, _output);
        const std::string answer(_line, size > 0 ? static_cast<size_t>(size) : 0);
        if (answer.find(R"("result":)") == std::string::npos ||
            answer.find(R"("isError":true)") != std::string::npos) {
            throw std::runtime_error("answer: " + answer);
        }
        return answer;
    }

private:
    pid_t _pid = -1;
    int _input = -1;
    std::FILE* _output = nullptr;
    char* _line = nullptr;
    size_t _room = 0;
};

void CompareCall(const std::string& title, const std::string& descriptor,
                 const std::list<std::string>& path, const std::string& tool, const char* target) {
    AutoCli::Dispatcher dispatcher;
    dispatcher.AddPlugin(descriptor);
    Server server({SERVER, "--allow", "*", "--plugin", descriptor});
    Paired::Compare(
        title, 101,
        {{"kelvash-mcp",
          [&] { Paired::Keep(server.Ask("tools/call", R"({"name":")" + tool + "\"}")); }},
         {"in this process, and the JSON",
          [&] {
              const auto input = AutoCli::CommandInput::New();
              const auto output = AutoCli::CommandOutput::New();
              input->SetCommandPath(path);
              dispatcher.ExecuteCommand(input, output);
              std::string text;
              AutoCli::AutoCli_WriteJsonText(output->GetRootObject().get(),
                                             [&](std::string_view piece) { text += piece; });
              Paired::Keep(nlohmann::json(text).dump());
          },
          target}});
}

std::string Tree(int commands) {
    std::string text =
        "<plugin><version>1.0.0</version><namespaces><namespace path=\"many\">"
        "<description>Many</description></namespace></namespaces><commands>";
    for (int i = 0; i < commands; ++i) {
        text += "<command path=\"many.c" + std::to_string(i) +
                "\"><description>One of many</description><input-spec><parameter name=\"name\""
                " type=\"string\" required=\"true\"><description>Which</description><constraint"
                " type=\"regex\"><regex>[a-z0-9]+</regex></constraint></parameter></input-spec>"
                "<output-spec><list type=\"string\"/></output-spec><format-parameters/><execute>"
                "echo '&lt;o>&lt;list type=\"string\">&lt;/list>&lt;/o>'</execute></command>";
    }
    return text + "</commands></plugin>";
}

void TimeListing(const std::string& descriptor) {
    Server server({SERVER, "--allow", "*", "--plugin", descriptor});
    server.Ask("ping", "{}");
    size_t tools = 0;
    const double seconds = Paired::Seconds([&] {
        std::string cursor;
        do {
            const auto page = nlohmann::json::parse(server.Ask(
                "tools/list", cursor.empty() ? "{}" : R"({"cursor":")" + cursor + "\"}"));
            tools += page["result"]["tools"].size();
            cursor = page["result"].value("nextCursor", "");
        } while (!cursor.empty());
    });
    std::printf("listing %zu tools, page by page, and reading them: %s  less than 1 s\n", tools,
                Paired::TimeText(seconds).c_str());
}

}  // namespace

int main() {
    setenv("KELVASH_COMMANDS", COMMANDS "/scripts", 1);
    CompareCall("a call of storage filesystem list", COMMANDS "/storage.xml",
                {"storage", "filesystem", "list"}, "storage_filesystem_list", "at most 1.1");
    const auto many =
        std::filesystem::temp_directory_path() / ("many-" + std::to_string(getpid()) + ".xml");
    std::ofstream(many) << Tree(10'000);
    TimeListing(many);
    std::filesystem::remove(many);
}
