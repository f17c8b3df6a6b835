// The engine expands one parameter after the other, by name, in a text that it does not parse.
// These rules tell where that is not what the author means, and where a value becomes a part of the
// text.

#include <author/lint/Rules.h>
#include <author/lint/Suggest.h>

#include <algorithm>
#include <map>
#include <set>

namespace Author {

namespace {

using Kind = TemplateNode::Kind;
using Around = std::vector<const TemplateNode*>;

std::string Options(const std::vector<std::string>& options) {
    std::vector<std::string> words;
    words.reserve(options.size());
    for (const std::string& option : options) {
        words.push_back("--" + option);
    }
    return words.empty() ? "without options" : "with " + JoinedByOr(words, " and ");
}

// The part where the text differs from the other, with a little of what stands around it.
std::string Difference(const std::string& text, const std::string& other) {
    constexpr size_t around = 20;
    constexpr size_t longest = 70;
    const auto [place, otherPlace] =
        std::mismatch(text.begin(), text.end(), other.begin(), other.end());
    const auto same = static_cast<size_t>(place - text.begin());
    const size_t begin = same > around ? same - around : 0;
    const std::string part = text.substr(begin, longest);
    return (begin > 0 ? "..." : "") + part + (begin + part.size() < text.size() ? "..." : "");
}

// Why the order of expansion matters here; the first reason that applies.
std::string OrderAdvice(const Template& read) {
    std::string advice;
    ForEachForm(read.nodes, [&advice](const TemplateNode& form, const Around& around) {
        if (!advice.empty() || around.empty()) {
            return;
        }
        const TemplateNode& outer = *around.back();
        if (form.kind == Kind::If) {
            advice = "an $if has no place in another one: let the script judge both options";
        } else if (form.name > outer.name) {
            advice = "parameters are expanded in the order of their names, and the text of $if{" +
                     outer.name +
                     ",...} ends at the first brace that is left: forms in it must be "
                     "of names that sort before '" +
                     outer.name + "', or of itself";
        } else if (form.IsList() && form.name == outer.name && &form != &outer.body.back()) {
            advice = "a list form must stand at the very end of its own $if";
        }
    });
    return advice.empty()
               ? "write shell variables as ${NAME}, put { ...; } into the script, and give "
                 "all lists of a parameter the same arguments"
               : advice;
}

bool MayHold(const DeclaredParameter& parameter, std::string_view characters) {
    return std::ranges::all_of(characters, [&parameter](char c) {
        return parameter.characters[static_cast<unsigned char>(c)];
    });
}

// Can a value be a form? An expression that looks around may keep forms out though it lets their
// characters through: then the engine is asked.
bool MaySpellForm(const DeclaredCommand& command, const DeclaredParameter& parameter) {
    if (!MayHold(parameter, "${}") || !parameter.hasLookaround) {
        return MayHold(parameter, "${}");
    }
    return std::ranges::any_of(command.ParameterNames(), [&](const std::string& name) {
        return Accepts(*parameter.spec, "$val{" + name + "}") ||
               Accepts(*parameter.spec, "$if{" + name + ",x}") ||
               Accepts(*parameter.spec, "$list{" + name + ",',',true}") ||
               Accepts(*parameter.spec, "$multilist{" + name + ",x,true}");
    });
}

// Does the value stand in the text of a condition before that is looked at?
bool EndsCondition(const TemplateNode& form, const Around& around) {
    return std::ranges::any_of(around, [&form](const TemplateNode* outer) {
        return outer->kind == Kind::If &&
               (form.kind == Kind::Value ? form.name <= outer->name : form.name < outer->name);
    });
}

void CheckSpelledForm(const DeclaredCommand& command, const CheckedTemplate& checked,
                      const DeclaredParameter& parameter, bool endsCondition, Report& report) {
    const std::string& name = parameter.spec->GetName();
    const std::string how = parameter.hasConstraint ? "" : "has no constraint and ";
    if (MaySpellForm(command, parameter)) {
        const std::string text = "a value of --" + name + " " + how +
                                 "may spell a form, such as $multilist{" + name +
                                 ",x,false}, which is then expanded; ";
        if (checked.isStdin) {
            report.AddWarning(checked.node, "spell",
                              text + "keep $, { or } out by the constraint, as [^{}]* does");
        } else {
            report.AddError(checked.node, "spell",
                            text +
                                "keep braces and the single quote out by the constraint, as "
                                "[^{}']* does");
        }
    } else if (endsCondition && MayHold(parameter, "}")) {
        report.AddError(checked.node, "spell",
                        "a value of --" + name +
                            " may hold }, which ends the text of the $if around "
                            "it; keep it out by the constraint");
    }
}

}  // namespace

void CheckOrder(const DeclaredCommand& command, const CheckedTemplate& checked, Report& report) {
    std::set<std::string> left;
    for (const Expansion& expansion : checked.expansions) {
        left.insert(expansion.left.begin(), expansion.left.end());
    }
    for (const std::string& name : left) {
        const DeclaredParameter* parameter = command.Find(name);
        if (parameter) {
            report.AddError(checked.node, "left",
                            "when --" + name +
                                " is missing, its form arrives as it stands; put it "
                                "into $if{" +
                                name + ",...}");
        }
    }
    const auto differs = std::ranges::find_if(checked.expansions, [](const Expansion& expansion) {
        return expansion.text != expansion.expected;
    });
    if (differs != checked.expansions.end()) {
        const std::string text = Readable(differs->text, command);
        const std::string expected = Readable(differs->expected, command);
        report.AddError(checked.node, "order",
                        Options(differs->options) + " this becomes \"" +
                            Difference(text, expected) + "\" and not \"" +
                            Difference(expected, text) + "\": " + OrderAdvice(checked.read));
    }
}

void CheckSpelling(const DeclaredCommand& command, const CheckedTemplate& checked, Report& report) {
    std::map<const DeclaredParameter*, bool> read;  // and whether its value can end a condition
    ForEachForm(checked.read.nodes, [&](const TemplateNode& form, const Around& around) {
        const DeclaredParameter* parameter = command.Find(form.name);
        if (parameter && form.kind != Kind::If) {
            read[parameter] = read[parameter] || EndsCondition(form, around);
        }
    });
    for (const DeclaredParameter& parameter : command.parameters) {
        if (const auto found = read.find(&parameter); found != read.end()) {
            CheckSpelledForm(command, checked, parameter, found->second, report);
        }
    }
}

}  // namespace Author
