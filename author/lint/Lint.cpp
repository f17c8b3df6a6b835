#include <author/lint/Lint.h>
#include <author/lint/Rules.h>
#include <author/lint/SchemaCheck.h>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <set>

namespace Author {

namespace {

constexpr off_t largestFile = 16 * 1024 * 1024;

class FileDescriptor {
public:
    explicit FileDescriptor(int descriptor) : _descriptor(descriptor) {}
    FileDescriptor(const FileDescriptor&) = delete;
    FileDescriptor& operator=(const FileDescriptor&) = delete;
    ~FileDescriptor() {
        if (_descriptor >= 0) {
            close(_descriptor);
        }
    }
    [[nodiscard]] int Get() const { return _descriptor; }

private:
    int _descriptor;
};

[[noreturn]] void FailToRead(const std::string& path, const std::string& reason) {
    throw Unreadable("Unable to read " + path + ": " + reason);
}

// Without waiting for the other end of a pipe, and without taking in what nobody has written by
// hand.
std::string ReadFile(const std::string& path) {
    const FileDescriptor file(open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC));
    struct stat status {};
    if (file.Get() < 0 || fstat(file.Get(), &status) != 0) {
        FailToRead(path, std::strerror(errno));
    }
    if (!S_ISREG(status.st_mode)) {
        FailToRead(path, "it is no regular file");
    }
    if (status.st_size > largestFile) {
        FailToRead(path, "it is larger than 16 MiB");
    }
    std::string text(static_cast<size_t>(status.st_size), '\0');
    size_t size = 0;
    while (size < text.size()) {
        const ssize_t count = read(file.Get(), text.data() + size, text.size() - size);
        if (count < 0 && errno == EINTR) {
            continue;
        }
        if (count < 0) {
            FailToRead(path, std::strerror(errno));
        }
        if (count == 0) {
            break;
        }
        size += static_cast<size_t>(count);
    }
    text.resize(size);
    return text;
}

std::vector<CheckedTemplate> ReadTemplates(const DeclaredCommand& command) {
    std::vector<CheckedTemplate> templates;
    for (const bool isStdin : {false, true}) {
        const xmlNode* node = Child(command.node, isStdin ? "stdin" : "execute");
        if (node) {
            CheckedTemplate checked{node, isStdin, Content(node), {}, {}};
            checked.read = ReadTemplate(checked.text);
            checked.expansions = Simulate(command, checked.read, isStdin);
            templates.push_back(std::move(checked));
        }
    }
    return templates;
}

// The engine has the last word on a file without an error.
void CheckLoading(const xmlNode* root, Report& report) {
    try {
        AutoCli::XmlPlugin::New(report.GetFile())->Initialize();
    } catch (const Zelmar::ZelmarException& error) {
        report.AddError(root, "load", error.what());
    }
}

}  // namespace

std::vector<std::string> DescriptorsAt(const std::string& path) {
    std::error_code error;
    if (!std::filesystem::is_directory(path, error)) {
        return {path};
    }
    std::set<std::string> files;
    for (const auto& entry : std::filesystem::directory_iterator(path, error)) {
        if (entry.path().extension() == ".xml") {
            files.insert(entry.path());
        }
    }
    if (error) {
        FailToRead(path, error.message());
    }
    if (files.empty()) {
        FailToRead(path, "there is no .xml file in it");
    }
    return {files.begin(), files.end()};
}

void Lint::Add(const std::string& file) {
    _files.push_back(file);
    Report report(file, _findings);
    XmlFault fault;
    const XmlDocument document = ReadXml(ReadFile(file), fault);
    if (document) {
        CheckDocument(document.get(), report);
    } else {
        report.AddAt(fault.line, "xml", fault.text.empty() ? "the file is empty" : fault.text);
    }
}

void Lint::CheckDocument(xmlDoc* document, Report& report) {
    xmlNode* root = xmlDocGetRootElement(document);
    if (document->intSubset) {
        report.AddError(root, "doctype",
                        "a descriptor needs no document type declaration; leave it out, and write "
                        "what its entities stand for");
        return;
    }
    if (!IsElement(root, "plugin")) {
        report.AddWarning(root, "schema",
                          "the document element is <" + NameOf(root) +
                              ">; the engine takes any name, editors and the schema take <plugin>");
        xmlNodeSetName(root, reinterpret_cast<const xmlChar*>("plugin"));
    }
    report.CheckComments(root);
    CheckContents(root, report);
    CheckSchema(document, report);
    const xmlNode* commands = Child(root, "commands");
    if (!commands && !Child(root, "namespaces")) {
        report.AddError(root, "schema", "<plugin> has neither <namespaces> nor <commands>");
    }
    for (const xmlNode* command : Children(commands, "command")) {
        CheckCommand(command, report);
    }
    _paths.Add(root, report);
    if (!report.HasErrorIn(root)) {
        CheckLoading(root, report);
    }
}

void Lint::CheckCommand(const xmlNode* node, Report& report) {
    CheckParameters(node, report);
    const auto command = ReadCommand(node, report);
    if (!command) {
        return;
    }
    CheckExpressions(*command, report);
    const auto templates = ReadTemplates(*command);
    CheckUse(*command, templates, report);
    for (const CheckedTemplate& checked : templates) {
        CheckForms(*command, checked, report);
        CheckOrder(*command, checked, report);
        CheckSpelling(*command, checked, report);
        CheckSecrets(*command, checked, report);
        if (!checked.isStdin) {
            CheckQuoting(checked, report);
            CheckLine(checked, report, _syntax);
        }
    }
    CheckFormat(*command, report);
}

std::vector<Finding> Lint::Finish() {
    for (auto&& more : {_paths.Check(), _syntax.Run()}) {
        _findings.insert(_findings.end(), more.begin(), more.end());
    }
    std::map<std::string, size_t> order;
    for (const std::string& file : _files) {
        order.emplace(file, order.size());
    }
    std::ranges::stable_sort(_findings, {}, [&order](const Finding& finding) {
        return std::pair(order.at(finding.file), finding.line);
    });
    return std::move(_findings);
}

}  // namespace Author
