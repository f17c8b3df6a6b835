#include <author/lint/Rules.h>
#include <author/lint/ShellLine.h>
#include <author/lint/Suggest.h>

#include <set>

namespace Author {

namespace {

// What a character does depends on two things: the quotes it ends up in, and what the engine has
// done to the value. Both are seen in the expanded line; this table tells what follows.
struct Hazard {
    Quoting quoting;
    unsigned treatments;
    std::string_view rule;
    Severity severity;
    std::string_view characters;
    std::string_view text;  ///< behind the names of the characters
};

constexpr unsigned Mask(Treatment treatment) {
    return 1U << static_cast<unsigned>(treatment);
}

constexpr unsigned escaped = Mask(Treatment::Escaped);
constexpr unsigned withoutSingle = Mask(Treatment::WithoutSingleQuotes);
constexpr unsigned withoutDouble = Mask(Treatment::WithoutDoubleQuotes);
constexpr unsigned unchanged = Mask(Treatment::Unchanged);
constexpr unsigned any = escaped | withoutSingle | withoutDouble | unchanged;

constexpr Hazard hazards[] = {
    {Quoting::Bare, escaped, "unquoted", Severity::Error, " \t\n?[#~",
     "on which the shell acts without quotes; write '$val{NAME}', in single quotes"},
    {Quoting::Bare, any & ~escaped, "quotes", Severity::Error, " \t\n?[#~!\"$&'()*;<>\\^`|",
     "and the quotes beside it belong to other words, so that nothing protects it; write "
     "'$val{NAME}' as an argument of its own"},
    {Quoting::Single, withoutSingle, "removed", Severity::Warning, "'",
     "which is silently taken out; keep it out by the constraint"},
    {Quoting::Single, any & ~withoutSingle, "quotes", Severity::Error, "'",
     "which ends the quotes around it; write '$val{NAME}' as an argument of its own"},
    {Quoting::Single, escaped, "visible", Severity::Warning, "\n!\"$&()*;<>\\^`|",
     "in front of which a backslash arrives; write '$val{NAME}' as an argument of its own"},
    {Quoting::Double, escaped, "visible", Severity::Warning, "\n!&'()*;<>^|",
     "in front of which a backslash arrives in double quotes; write '$val{NAME}', in single ones"},
    {Quoting::Double, withoutDouble, "active", Severity::Error, "$`\\",
     "which stay active in double quotes and can run commands; keep them out by the constraint"},
    {Quoting::Double, withoutDouble, "removed", Severity::Warning, "\"",
     "which is silently taken out; keep it out by the constraint"},
    {Quoting::Double, withoutSingle | unchanged, "quotes", Severity::Error, "$`\\\"",
     "which stay active, for the single quotes stand within double ones; write '$val{NAME}' as an "
     "argument of its own"},
    {Quoting::SingleInBackquotes, any, "quotes", Severity::Error, "`\\",
     "on which the backquotes around it act, even in single quotes; write $(...) for them"},
    {Quoting::Comment, any, "quotes", Severity::Error, "\n",
     "which end the comment around it; leave the comment out"},
};

std::string NameOfCharacter(char c) {
    return c == ' ' ? "blanks" : c == '\t' ? "tabs" : c == '\n' ? "line feeds" : std::string(1, c);
}

// `#` opens a comment and `~` is a folder only where a word begins.
bool IsHarmlessInside(char c) {
    return c == '#' || c == '~';
}

void Tell(const CheckedTemplate& checked, const DeclaredParameter& parameter, const Hazard& hazard,
          bool beginsWord, Report& report) {
    std::vector<std::string> held;
    for (const char c : hazard.characters) {
        if (parameter.characters[static_cast<unsigned char>(c)] &&
            (beginsWord || !IsHarmlessInside(c))) {
            held.push_back(NameOfCharacter(c));
        }
    }
    if (held.empty()) {
        return;
    }
    const std::string& name = parameter.spec->GetName();
    std::string text = "--" + name + (parameter.hasConstraint ? "" : " has no constraint and") +
                       " may hold " + JoinedByOr(held) + ", " + std::string(hazard.text);
    constexpr std::string_view advised = "'$val{NAME}'";
    if (const size_t place = text.find(advised); place == std::string::npos) {
        // The advice fits any parameter.
    } else if (parameter.spec->AllowMultiple()) {
        text.replace(place, std::string::npos,
                     "$multilist{" + name + ",--" + name +
                         ",true}, and keep $, ` and \\ out by the "
                         "constraint");
    } else {
        text.replace(place, advised.size(), "'$val{" + name + "}'");
    }
    hazard.severity == Severity::Error
        ? report.AddError(checked.node, hazard.rule, std::move(text))
        : report.AddWarning(checked.node, hazard.rule, std::move(text));
}

}  // namespace

void CheckQuoting(const CheckedTemplate& checked, Report& report) {
    std::set<std::pair<const DeclaredParameter*, const Hazard*>> told;
    for (const Expansion& expansion : checked.expansions) {
        const ShellLine line = ReadShellLine(expansion.text);
        for (const auto& [parameter, place, treatment] : expansion.occurrences) {
            for (const Hazard& hazard : hazards) {
                if (hazard.quoting == line.quoting[place] &&
                    (hazard.treatments & Mask(treatment)) != 0 &&
                    told.emplace(parameter, &hazard).second) {
                    Tell(checked, *parameter, hazard, line.beginsWord[place], report);
                }
            }
        }
    }
}

}  // namespace Author
