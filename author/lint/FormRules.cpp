#include <author/lint/Rules.h>
#include <author/lint/Suggest.h>

#include <algorithm>
#include <set>

namespace Author {

namespace {

using Kind = TemplateNode::Kind;
using Around = std::vector<const TemplateNode*>;

// What does not fit the kind of the parameter; empty when all is well.
std::string Misfit(const TemplateNode& form, const CallSpec::ParameterSpec& parameter) {
    const std::string& name = parameter.GetName();
    if (parameter.GetType() == CallSpec::ParameterTypeFlag && form.kind != Kind::If) {
        return form.text + ": a flag has no value; write $if{" + name + ",TEXT}";
    }
    if (form.kind == Kind::Value && parameter.AllowMultiple()) {
        return form.text + ": each call with --" + name +
               " fails, for a list has no single value; write $multilist{" + name + ",--" + name +
               ",true}";
    }
    return "";
}

bool ReadsValue(const std::vector<TemplateNode>& nodes, const std::string& name) {
    return std::ranges::any_of(nodes, [&name](const TemplateNode& node) {
        return node.kind == Kind::If ? ReadsValue(node.body, name)
                                     : node.kind != Kind::Text && node.name == name;
    });
}

void CheckForm(const DeclaredCommand& command, const CheckedTemplate& checked,
               const TemplateNode& form, Report& report) {
    const DeclaredParameter* parameter = command.Find(form.name);
    if (!parameter) {
        report.AddError(checked.node, "unknown",
                        "there is no parameter '" + form.name + "' for " + form.text +
                            Suggestion(form.name, command.ParameterNames()));
        return;
    }
    const std::string misfit = Misfit(form, *parameter->spec);
    if (!misfit.empty()) {
        report.AddError(checked.node, "kind", misfit);
    } else if (form.IsList() && !parameter->spec->AllowMultiple()) {
        report.AddWarning(checked.node, "kind",
                          form.text + " reads a single value; write '$val{" + form.name + "}'");
    }
    if (form.kind == Kind::If && parameter->spec->GetType() == CallSpec::ParameterTypeBool &&
        !ReadsValue(form.body, form.name)) {
        report.AddWarning(checked.node, "bool",
                          form.text + ": its text is there for --" + form.name +
                              " no as well; make it a flag, or pass '$val{" + form.name + "}'");
    }
}

}  // namespace

void CheckForms(const DeclaredCommand& command, const CheckedTemplate& checked, Report& report) {
    for (const std::string& fault : checked.read.faults) {
        report.AddError(checked.node, "form", fault);
    }
    ForEachForm(checked.read.nodes, [&](const TemplateNode& form, const Around&) {
        CheckForm(command, checked, form, report);
    });
}

void CheckUse(const DeclaredCommand& command, const std::vector<CheckedTemplate>& templates,
              Report& report) {
    std::set<std::string> read;
    for (const CheckedTemplate& checked : templates) {
        ForEachForm(checked.read.nodes,
                    [&read](const TemplateNode& form, const Around&) { read.insert(form.name); });
    }
    for (const DeclaredParameter& parameter : command.parameters) {
        if (!read.contains(parameter.spec->GetName())) {
            report.AddWarning(parameter.node, "unread",
                              "nothing reads --" + parameter.spec->GetName() +
                                  "; use it in <execute> or <stdin>, or leave it out");
        }
    }
}

void CheckSecrets(const DeclaredCommand& command, const CheckedTemplate& checked, Report& report) {
    ForEachForm(checked.read.nodes, [&](const TemplateNode& form, const Around&) {
        const DeclaredParameter* parameter = command.Find(form.name);
        if (parameter && parameter->spec->IsSecret() && form.kind != Kind::If && !checked.isStdin) {
            report.AddError(checked.node, "secret",
                            "the secret --" + form.name +
                                " stands in the command line, which "
                                "everybody on the machine can read; pass it through <stdin>");
        }
    });
}

}  // namespace Author
