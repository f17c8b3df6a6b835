#include <author/lint/Rules.h>
#include <author/lint/Suggest.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <optional>

namespace Author {

namespace {

// The elements that hold a text and nothing else.
bool HoldsText(const std::string& element) {
    constexpr auto names = std::to_array<std::string_view>(
        {"version", "description", "meta-data-entry", "context-supported", "regex", "enum-value",
         "formatter", "format-parameter", "execute", "stdin"});
    return std::ranges::find(names, element) != names.end();
}

void CheckContent(const xmlNode* element, Report& report) {
    const auto pieces = Pieces(element);
    const bool hasComment = std::ranges::any_of(
        pieces, [](const xmlNode* piece) { return piece->type == XML_COMMENT_NODE; });
    if (pieces.size() > 1 || hasComment) {
        report.AddError(element, "content",
                        "of <" + NameOf(element) + "> the engine reads the last piece alone, \"" +
                            Content(element) + "\"; " +
                            (hasComment ? "put the comment ahead of the element"
                                        : "write the whole text either plain or as one CDATA"));
    }
}

std::optional<long> WholeNumber(const std::string& text) {
    long number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    const bool isWhole = error == std::errc() && end == text.data() + text.size();
    return isWhole ? std::optional(number) : std::nullopt;
}

std::string DataElement(const std::string& type) {
    return type == "regex" || type == "range" ? type : "enum";
}

void CheckConstraint(const xmlNode* constraint, const std::string& parameterType, Report& report) {
    const std::string type = Attribute(constraint, "type");
    const bool isForInts = type == "range" || type == "intenum";
    const std::string kind = parameterType.substr(0, parameterType.find("-list"));
    if (kind == "bool" || kind == "flag") {
        report.AddError(constraint, "type", "a " + kind + " takes no constraint; leave it out");
    } else if ((kind == "int") != isForInts) {
        report.AddError(constraint, "type",
                        "a constraint of the type " + type +
                            " does not fit a parameter of the type " + parameterType + "; take " +
                            (kind == "int" ? "range or intenum" : "regex or stringenum"));
    }
    if (!Child(constraint, DataElement(type).c_str())) {
        report.AddError(constraint, "type",
                        "a constraint of the type " + type + " needs <" + DataElement(type) + ">");
    }
    const xmlNode* range = Child(constraint, "range");
    const auto min = range ? WholeNumber(Attribute(range, "min")) : std::nullopt;
    const auto max = range ? WholeNumber(Attribute(range, "max")) : std::nullopt;
    if (min && max && *min > *max) {
        report.AddError(range, "range",
                        "the range is the wrong way round; write min=\"" + std::to_string(*max) +
                            "\" max=\"" + std::to_string(*min) + "\"");
    }
    for (const xmlNode* value : Children(Child(constraint, "enum"), "enum-value")) {
        if (type == "intenum" && !WholeNumber(Attribute(value, "value"))) {
            report.AddError(value, "type",
                            "'" + Attribute(value, "value") + "' is no whole number");
        }
    }
}

}  // namespace

void CheckContents(const xmlNode* root, Report& report) {
    if (HoldsText(NameOf(root))) {
        CheckContent(root, report);
    }
    for (const xmlNode* child = root->children; child; child = child->next) {
        if (child->type == XML_ELEMENT_NODE) {
            CheckContents(child, report);
        }
    }
}

void CheckParameters(const xmlNode* command, Report& report) {
    for (const xmlNode* parameter : Children(Child(command, "input-spec"), "parameter")) {
        const std::string type = Attribute(parameter, "type");
        if (Attribute(parameter, "name") == "help") {
            report.AddError(parameter, "name",
                            "each command has the parameter help already, and fails with a second "
                            "one; take another name");
        }
        if (Attribute(parameter, "shortname") == "h") {
            report.AddError(parameter, "name",
                            "-h is the help of each command; take another letter");
        }
        if (Attribute(parameter, "secret") == "true" && type != "string") {
            report.AddError(parameter, "type", "only a string can be secret");
        }
        for (const xmlNode* constraint : Children(parameter, "constraint")) {
            if (!report.HasErrorIn(constraint)) {
                CheckConstraint(constraint, type, report);
            }
        }
    }
}

void CheckExpressions(const DeclaredCommand& command, Report& report) {
    for (const DeclaredParameter& parameter : command.parameters) {
        const auto constraint = parameter.spec->GetConstraint();
        if (!constraint || constraint->GetType() != CallSpec::ConstraintTypeStringRegex) {
            continue;
        }
        const xmlNode* place = Child(Child(parameter.node, "constraint"), "regex");
        const std::string& expression = constraint->GetStringRegex();
        auto output = CallSpec::Output::New();
        constraint->Validate("", parameter.spec->GetName(), output);
        const std::string mark = "Unable to apply the regular expression (" + expression + "): ";
        const std::string verdict = output->HasError() ? output->GetErrors().front() : "";
        constexpr std::string_view blanks = " \t\n\r";
        if (const size_t at = verdict.find(mark); at != std::string::npos) {
            report.AddError(place, "regex",
                            "the expression does not compile, so that each value is refused: " +
                                verdict.substr(at + mark.size()));
        } else if (ReadExpression(expression).blowsUp) {
            report.AddError(place, "slow",
                            "the expression can match the same text in ever more ways, and takes "
                            "exponential time; do not repeat what is repeated already");
        }
        if (blanks.find(expression.front()) != std::string_view::npos ||
            blanks.find(expression.back()) != std::string_view::npos) {
            report.AddError(
                place, "blanks",
                "the blanks at the ends of the expression belong to it, and values must "
                "have them; leave them out");
        }
    }
}

}  // namespace Author
