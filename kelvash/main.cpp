#include "Program.h"

int main(int argc, char** argv) {
    return RunProgram([=](AutoCli::CliDispatcher& dispatcher) {
        AutoCli::AutoCli_AnswerCompletion(dispatcher);
        return dispatcher.Run(argc, argv);
    });
}
