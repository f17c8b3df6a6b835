// A line typed into the shell, from the key to the next prompt, beside a call of the tool a line.

#include <pty.h>

#include <string_view>

#include "Paired.h"

namespace {

constexpr int lines = 20;
constexpr std::string_view line = "--formatter json kelvash command list\n";

// The shell on a terminal of its own.
class Shell {
public:
    Shell() : _process(forkpty(&_terminal, nullptr, nullptr, nullptr)) {
        if (_process == 0) {
            setenv("TERM", "dumb", 1);
            setenv("HOME", "", 1);  // and so without a history
            execl(KELVASH_SHELL, KELVASH_SHELL, nullptr);
            _exit(1);
        }
        WaitForPrompt();
    }
    Shell(const Shell&) = delete;
    Shell& operator=(const Shell&) = delete;
    ~Shell() {
        close(_terminal);
        waitpid(_process, nullptr, 0);
    }

    void RunLine() const {
        if (write(_terminal, line.data(), line.size()) != static_cast<ssize_t>(line.size())) {
            throw std::runtime_error("write");
        }
        WaitForPrompt();
    }

private:
    void WaitForPrompt() const {
        std::string text;
        char block[4096];
        while (!text.ends_with("\nkelvash> ") && text != "kelvash> ") {
            const ssize_t count = read(_terminal, block, sizeof block);
            if (count <= 0) {
                throw std::runtime_error("Unable to run " KELVASH_SHELL);
            }
            text.append(block, static_cast<size_t>(count));
        }
    }

    int _terminal = -1;
    pid_t _process;
};

}  // namespace

int main() {
    const Shell shell;
    const auto typed = [&shell] {
        for (int i = 0; i < lines; ++i) {
            shell.RunLine();
        }
    };
    const auto called = [] {
        for (int i = 0; i < lines; ++i) {
            Paired::RunProgram(
                {.words = {KELVASH, "--formatter", "json", "kelvash", "command", "list"}});
        }
    };
    Paired::Compare("a line of \"kelvash command list\"", 31,
                    {{.name = "typed into kelvash-shell", .run = typed, .times = lines},
                     {"a call of kelvash", called, "", lines}});
}
