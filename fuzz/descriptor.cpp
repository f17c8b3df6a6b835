// A descriptor file, from its bytes to nodes in a tree.

#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/Namespace.h>
#include <zelmar/autocli/extension/XmlPlugin.h>

#include <sys/mman.h>
#include <unistd.h>

#include <cstdint>
#include <cstdlib>
#include <string>

namespace {

// A file that is only in memory, with the name that others know it by.
class MemoryFile {
public:
    MemoryFile(const std::uint8_t* data, std::size_t size) : _file(memfd_create("descriptor", 0)) {
        if (write(_file, data, size) != static_cast<ssize_t>(size)) {
            std::abort();
        }
    }
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;
    ~MemoryFile() { close(_file); }

    [[nodiscard]] std::string Path() const { return "/proc/self/fd/" + std::to_string(_file); }

private:
    int _file;
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const MemoryFile file(data, size);
    const auto root = AutoCli::RootNamespace::New(nullptr);
    const auto plugin = AutoCli::XmlPlugin::New(file.Path());
    try {
        plugin->Initialize();
        plugin->RegisterNamespaces(root);
    } catch (const Zelmar::ZelmarException&) {
        // Nearly every input is wrong somewhere, and said to be.
    }
    return 0;
}
