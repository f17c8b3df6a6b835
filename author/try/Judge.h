#pragma once

#include <zelmar/zelmar.h>

#include <string>
#include <string_view>
#include <vector>

namespace Author {

/// What is wrong with a printed document, in the order of its lines. Of a flood the first are kept.
struct Faults {
    struct Fault {
        long line;
        std::string text;  ///< with the place of the value
    };
    std::vector<Fault> kept;
    size_t count = 0;
    bool isWellFormed = true;

    void Add(long line, std::string text);
};

/// Holds a document against the declared shape, value by value: what is refused, what is read as
/// something else, what is dropped, and what is lacking. Places are written as `result[1].Size`,
/// the first item being 0. A null shape is any. The parser goes on behind what is not well-formed,
/// as far as it can. Memory is that of the faults and of the longest text; a document that declares
/// entities is not expanded.
Faults JudgeDocument(std::string_view document, const MetaObj::MetaObject* declared);

/// The same for all that a process printed, which may be lines that begin with "ERROR:" instead.
/// Those that stand where nobody reads them are faults, and so is what stands behind them.
Faults JudgePrinted(std::string_view printed, const MetaObj::MetaObject* declared);

/// libxml2 says nothing on the error stream while one of these is there.
class QuietXml {
public:
    QuietXml();
    QuietXml(const QuietXml&) = delete;
    QuietXml& operator=(const QuietXml&) = delete;
    ~QuietXml();
};

}  // namespace Author
