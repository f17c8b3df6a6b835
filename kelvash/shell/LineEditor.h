#pragma once

#include <histedit.h>

#include <functional>
#include <memory>
#include <optional>
#include <string>

namespace KelvashShell {

/// Reads lines from a terminal, edited as the user's ~/.editrc wants it.
class LineEditor {
public:
    /// What can follow on a line up to the cursor: what to put in at once, and what prints all that
    /// there is to choose from.
    struct Proposal {
        std::string insertion;
        std::function<void()> print;
    };
    using Proposer = std::function<Proposal(const std::string& line)>;

    /// The standard streams must be terminals.
    explicit LineEditor(Proposer propose);

    /// The next line, without its end. Nothing when Ctrl-D was typed on an empty line, or when the
    /// terminal is gone. Ctrl-C gives up a line and is an empty one.
    std::optional<std::string> Read(const std::string& prompt);

    /// Lets the line be found by the keys that go back.
    void Remember(const std::string& line);

private:
    static LineEditor& Self(EditLine* editor);
    static char* Prompt(EditLine* editor);
    static unsigned char Complete(EditLine* editor, int key);
    static unsigned char ListOrInsert(EditLine* editor, int key);
    static unsigned char GiveUpLine(EditLine* editor, int key);
    static unsigned char Stop(EditLine* editor, int key);

    [[nodiscard]] std::string UpToCursor() const;
    unsigned char Print(const Proposal& proposal);

    Proposer _propose;
    std::string _prompt;
    std::unique_ptr<::History, void (*)(::History*)> _history;
    std::unique_ptr<EditLine, void (*)(EditLine*)> _editor;
};

}  // namespace KelvashShell
