#pragma once

#include <author/lint/Declared.h>
#include <author/lint/Simulation.h>
#include <author/lint/SyntaxCheck.h>

// The rules, by topic. Each reports what it finds.

namespace Author {

/// A template of a command, with what the engine makes of it.
struct CheckedTemplate {
    const xmlNode* node;
    bool isStdin;
    std::string text;
    Template read;
    std::vector<Expansion> expansions;
};

/// What a schema cannot say of the elements.
void CheckContents(const xmlNode* root, Report& report);
void CheckParameters(const xmlNode* command, Report& report);
/// Expressions that do not compile, or that take exponential time.
void CheckExpressions(const DeclaredCommand& command, Report& report);

/// Forms and the names in them.
void CheckForms(const DeclaredCommand& command, const CheckedTemplate& checked, Report& report);
/// Parameters that no template reads.
void CheckUse(const DeclaredCommand& command, const std::vector<CheckedTemplate>& templates,
              Report& report);
/// Text that the order of expansion leaves behind or loses.
void CheckOrder(const DeclaredCommand& command, const CheckedTemplate& checked, Report& report);
/// Values that change what is expanded after them.
void CheckSpelling(const DeclaredCommand& command, const CheckedTemplate& checked, Report& report);
/// Values and the quotes around them.
void CheckQuoting(const CheckedTemplate& checked, Report& report);
/// The line as a shell reads it: its syntax, its lines, its programs.
void CheckLine(const CheckedTemplate& checked, Report& report, SyntaxCheck& syntax);
void CheckSecrets(const DeclaredCommand& command, const CheckedTemplate& checked, Report& report);

/// The formatter and its parameters, against the declared shape.
void CheckFormat(const DeclaredCommand& command, Report& report);

}  // namespace Author
