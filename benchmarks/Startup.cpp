// What a call of the tool costs before any command runs: whole processes, from spawn to wait.

#include "Paired.h"

int main() {
    // A listing ends with 1, for no command has run.
    const auto kelvash = [] { Paired::RunProgram({.words = {KELVASH}, .status = 1}); };
    const auto floor = [] { Paired::RunProgram({.words = {FLOOR}}); };
    const auto bareFloor = [] { Paired::RunProgram({.words = {BARE_FLOOR}}); };
    Paired::Compare("start-up: kelvash lists an empty tree", 500,
                    {{"kelvash", kelvash},
                     {"its libraries, one expression, one line", floor, "at most 1.3"},
                     {"the same without libzelmar", bareFloor}});
    Paired::Compare(
        "start-up with the plugin of further formats", 300,
        {{"with it",
          [] {
              Paired::RunProgram({.words = {KELVASH, "--plugin", FORMATS}, .status = 1});
          }},
         {"without", kelvash, "at most 1.15"}});
}
