#pragma once

namespace CLI {
class App;
}

// Each verb stands in a file of its own: one function adds it, with its options, to the program;
// another one runs it when it was chosen. What it throws is reported, and ends the program with 2.

namespace Author {

/// `status` becomes the exit status of the program: 0, or 1 when something was found.
void AddDoc(CLI::App& program, int& status);
void AddLint(CLI::App& program, int& status);
void AddNew(CLI::App& program, int& status);
void AddSchema(CLI::App& program, int& status);
void AddTest(CLI::App& program, int& status);
void AddTry(CLI::App& program, int& status);

}  // namespace Author
