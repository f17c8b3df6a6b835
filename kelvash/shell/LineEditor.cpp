#include "LineEditor.h"

#include "History.h"

#include <algorithm>
#include <csignal>
#include <cstdio>
#include <iostream>
#include <stdexcept>

namespace KelvashShell {

LineEditor::LineEditor(Proposer propose)
    : _propose(std::move(propose)),
      _history(history_init(), history_end),
      _editor(el_init("kelvash-shell", stdin, stdout, stderr), el_end) {
    EditLine* const editor = _editor.get();
    if (!editor || !_history) {
        throw std::runtime_error("Unable to edit lines on this terminal");
    }
    HistEvent event;
    history(_history.get(), &event, H_SETSIZE, static_cast<int>(History::longest));
    history(_history.get(), &event, H_SETUNIQUE, 1);
    el_set(editor, EL_CLIENTDATA, this);
    el_set(editor, EL_PROMPT, &LineEditor::Prompt);
    el_set(editor, EL_HIST, history, _history.get());
    el_set(editor, EL_EDITOR, "emacs");
    el_set(editor, EL_SIGNAL, 1);
    el_source(editor, nullptr);
    // Ctrl-C belongs to the line and not to the process as long as one is typed.
    el_set(editor, EL_SETTY, "-d", "-isig", nullptr);
    // The wide form keeps these texts themselves; the other one makes copies and loses them.
    el_wset(editor, EL_ADDFN, L"zelmar-complete", L"Complete the word", &LineEditor::Complete);
    el_wset(editor, EL_ADDFN, L"zelmar-list", L"List what can follow", &LineEditor::ListOrInsert);
    el_wset(editor, EL_ADDFN, L"zelmar-give-up", L"Give up the line", &LineEditor::GiveUpLine);
    el_wset(editor, EL_ADDFN, L"zelmar-stop", L"Stop the shell", &LineEditor::Stop);
    el_set(editor, EL_BIND, "^I", "zelmar-complete", nullptr);
    el_set(editor, EL_BIND, "?", "zelmar-list", nullptr);
    el_set(editor, EL_BIND, "^C", "zelmar-give-up", nullptr);
    el_set(editor, EL_BIND, "^Z", "zelmar-stop", nullptr);
}

std::optional<std::string> LineEditor::Read(const std::string& prompt) {
    _prompt = prompt;
    int length = 0;
    const char* line = el_gets(_editor.get(), &length);
    if (!line || length <= 0) {
        return std::nullopt;
    }
    std::string text(line, static_cast<size_t>(length));
    if (text.ends_with('\n')) {
        text.pop_back();
    }
    return text;
}

void LineEditor::Remember(const std::string& line) {
    HistEvent event;
    history(_history.get(), &event, H_ENTER, line.c_str());
}

LineEditor& LineEditor::Self(EditLine* editor) {
    void* self = nullptr;
    el_get(editor, EL_CLIENTDATA, &self);
    return *static_cast<LineEditor*>(self);
}

char* LineEditor::Prompt(EditLine* editor) {
    return Self(editor)._prompt.data();
}

unsigned char LineEditor::Complete(EditLine* editor, int) {
    LineEditor& self = Self(editor);
    const Proposal proposal = self._propose(self.UpToCursor());
    if (!proposal.insertion.empty()) {
        return el_insertstr(editor, proposal.insertion.c_str()) == 0 ? CC_REFRESH : CC_ERROR;
    }
    return self.Print(proposal);
}

// Within quotes a question mark is one.
unsigned char LineEditor::ListOrInsert(EditLine* editor, int) {
    LineEditor& self = Self(editor);
    const std::string line = self.UpToCursor();
    if (std::ranges::count(line, '"') % 2 == 1) {
        return el_insertstr(editor, "?") == 0 ? CC_REFRESH : CC_ERROR;
    }
    return self.Print(self._propose(line));
}

unsigned char LineEditor::GiveUpLine(EditLine* editor, int) {
    const LineInfo* line = el_line(editor);
    el_cursor(editor, static_cast<int>(line->lastchar - line->cursor));
    line = el_line(editor);
    el_deletestr(editor, static_cast<int>(line->lastchar - line->buffer));
    std::fputs("^C\n", stdout);
    return el_insertstr(editor, "\n") == 0 ? CC_NEWLINE : CC_ERROR;
}

unsigned char LineEditor::Stop(EditLine* editor, int) {
    el_set(editor, EL_PREP_TERM, 0);
    std::raise(SIGTSTP);
    el_set(editor, EL_PREP_TERM, 1);
    return CC_REDISPLAY;
}

std::string LineEditor::UpToCursor() const {
    const LineInfo* line = el_line(_editor.get());
    return {line->buffer, line->cursor};
}

unsigned char LineEditor::Print(const Proposal& proposal) {
    if (!proposal.print) {
        return CC_ERROR;
    }
    std::fputs("\n", stdout);
    proposal.print();
    std::cout.flush();
    return CC_REDISPLAY;
}

}  // namespace KelvashShell
