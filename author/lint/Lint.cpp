#include <author/Files.h>
#include <author/lint/Lint.h>
#include <author/lint/Rules.h>
#include <author/lint/SchemaCheck.h>

#include <algorithm>

namespace Author {

namespace {

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
