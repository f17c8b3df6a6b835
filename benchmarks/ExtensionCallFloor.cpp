// One extension call by hand: parses the descriptor, runs its first command, parses what that
// prints, and writes the first text in it as a line.

#include <fcntl.h>
#include <libxml/parser.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <iostream>
#include <string>
#include <string_view>

namespace {

const xmlNode* Find(const xmlNode* node, std::string_view name) {
    for (; node; node = node->next) {
        if (reinterpret_cast<const char*>(node->name) == name) {
            return node;
        }
        if (const xmlNode* below = Find(node->children, name)) {
            return below;
        }
    }
    return nullptr;
}

std::string TextOf(xmlDoc* document, std::string_view name) {
    const xmlNode* node = Find(xmlDocGetRootElement(document), name);
    return node ? reinterpret_cast<const char*>(node->children->content) : "";
}

std::string RunShell(const std::string& command) {
    int input[2];
    int output[2];
    if (pipe2(input, O_CLOEXEC) != 0 || pipe2(output, O_CLOEXEC) != 0) {
        return "";
    }
    posix_spawn_file_actions_t files;
    posix_spawn_file_actions_init(&files);
    posix_spawn_file_actions_adddup2(&files, input[0], 0);
    posix_spawn_file_actions_adddup2(&files, output[1], 1);
    const char* words[] = {"/bin/sh", "-c", command.c_str(), nullptr};
    pid_t process = 0;
    posix_spawn(&process, words[0], &files, nullptr, const_cast<char**>(words), environ);
    close(input[0]);
    close(output[1]);
    close(input[1]);
    std::string text;
    char block[1024];
    while (const ssize_t count = read(output[0], block, sizeof block)) {
        text.append(block, static_cast<size_t>(count));
    }
    waitpid(process, nullptr, 0);
    return text;
}

}  // namespace

int main(int, char** argv) {
    xmlDoc* descriptor = xmlReadFile(argv[1], nullptr, 0);
    const std::string printed = RunShell(TextOf(descriptor, "execute"));
    xmlDoc* document =
        xmlReadMemory(printed.data(), static_cast<int>(printed.size()), "STDOUT", nullptr, 0);
    std::cout << TextOf(document, "string") << std::endl;
    xmlFreeDoc(document);
    xmlFreeDoc(descriptor);
}
