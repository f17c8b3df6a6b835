// Running a command by the shell, beside the least that does the same.

#include <zelmar/autocli/extension/ShellCmd.h>

#include "Paired.h"

namespace {

constexpr int calls = 100;

// What reads the output is what the other does, too: both ends in one process, one read at a time.
std::string BareShell() {
    int input[2];
    int output[2];
    if (pipe2(input, O_CLOEXEC) != 0 || pipe2(output, O_CLOEXEC) != 0) {
        throw std::runtime_error("pipe2");
    }
    posix_spawn_file_actions_t files;
    posix_spawn_file_actions_init(&files);
    posix_spawn_file_actions_adddup2(&files, input[0], 0);
    posix_spawn_file_actions_adddup2(&files, output[1], 1);
    const char* words[] = {"/bin/sh", "-c", "echo text", nullptr};
    pid_t process = 0;
    if (posix_spawn(&process, words[0], &files, nullptr, const_cast<char**>(words), environ) != 0) {
        throw std::runtime_error("posix_spawn");
    }
    posix_spawn_file_actions_destroy(&files);
    close(input[0]);
    close(output[1]);
    close(input[1]);
    std::string text;
    char block[1024];
    while (const ssize_t count = read(output[0], block, sizeof block)) {
        text.append(block, static_cast<size_t>(count));
    }
    close(output[0]);
    int status = 0;
    waitpid(process, &status, 0);
    return text;
}

void RunOurs() {
    for (int i = 0; i < calls; ++i) {
        std::string output;
        AutoCli::AutoCli_ShellCmd("echo text", output, "");
        Paired::Keep(output);
    }
}

void RunBare() {
    for (int i = 0; i < calls; ++i) {
        Paired::Keep(BareShell());
    }
}

}  // namespace

int main() {
    Paired::Compare("running \"echo text\" by the shell", 31,
                    {{.name = "AutoCli_ShellCmd", .run = RunOurs, .times = calls},
                     {"bare posix_spawn, two pipes, read, wait", RunBare, "at most 1.1", calls}});
}
