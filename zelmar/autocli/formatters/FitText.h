#pragma once

#include <zelmar/autocli/formatters/TextWriter.h>

/// What `AutoCli_FitString` is told beside the text, under the names of its arguments.
struct Fit {
    int indent;
    int width;
    bool skipFirstIndent = false;
    bool endLine = false;
    char breakChar = 0;
    bool splitLines = false;
};

/// `AutoCli_FitString` for a text that is a part of a document.
void FitText(std::string_view text, const Fit& fit, TextWriter& out);
