// Only parses all files of a directory, one after the other.

#include <libxml/parser.h>

#include <filesystem>

int main(int, char** argv) {
    for (const auto& entry : std::filesystem::directory_iterator(argv[1])) {
        xmlFreeDoc(xmlReadFile(entry.path().c_str(), nullptr, 0));
    }
}
