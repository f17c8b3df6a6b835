// A program with commands of its own that needs no command line: it addresses them by path, passes
// their parameters as strings, reads their values, and formats them when a person is to see them.
// With words behind its name it is a tool as well.

#include "RoomList.h"

#include <iostream>
#include <sstream>

using AutoCli::CliDispatcher;
using AutoCli::CommandInput;
using AutoCli::CommandOutput;
using AutoCli::Dispatcher;
using MetaObj::MetaCast;
using MetaObj::MetaInt;
using MetaObj::MetaList;
using MetaObj::MetaStruct;

namespace {

std::shared_ptr<CommandInput> Call(const std::list<std::string>& path) {
    auto input = CommandInput::New();
    input->SetCommandPath(path);
    return input;
}

// The value of a command that succeeded needs no second look at its shape: the engine has compared
// it with what the command declares.
long WarmestTemperature(const MetaList& rooms) {
    long warmest = 0;
    for (const auto& item : rooms.GetObjects()) {
        const auto temperature = MetaCast<MetaStruct>(item.get())->GetField("Temperature");
        warmest = std::max(warmest, MetaCast<MetaInt>(temperature.get())->GetValue());
    }
    return warmest;
}

// The text that the command's own choice of a formatter gives, on a screen of 60 columns.
std::string Format(Dispatcher& dispatcher, const std::shared_ptr<CommandInput>& input,
                   const std::shared_ptr<CommandOutput>& output) {
    auto format = dispatcher.GetDefaultOutputFormatParameters(input, output);
    AutoCli::DisplayContext screen;
    screen.screenWidth = 60;
    std::ostringstream text;
    dispatcher.FormatOutput(output, format, screen, text);
    return text.str();
}

void Run(Dispatcher& dispatcher, const std::shared_ptr<CommandInput>& input) {
    auto output = CommandOutput::New();
    std::cout << "\n" << input->GetCommandPathString() << "\n";
    if (!dispatcher.ExecuteCommand(input, output)) {
        for (const std::string& message : output->GetErrors()) {
            std::cout << "failed: " << message << "\n";
        }
        return;
    }
    const auto rooms = output->GetRootObject();
    std::cout << "warmest: " << WarmestTemperature(*MetaCast<MetaList>(rooms.get())) << "\n"
              << Format(dispatcher, input, output);
}

}  // namespace

int main(int argc, char** argv) {
    const std::vector<Room> rooms = {{"cellar", 11}, {"kitchen", 21}, {"bathroom", 24}};
    CliDispatcher dispatcher;
    dispatcher.GetRootNamespace()->SubNamespace("room")->RegisterNamespaceNode(RoomList::New(rooms),
                                                                               "list");
    AutoCli::AutoCli_AnswerCompletion(dispatcher);
    if (argc > 1) {
        return dispatcher.Run(argc, argv);
    }

    Run(dispatcher, Call({"room", "list"}));

    auto warmOnes = Call({"room", "list"});
    warmOnes->AddParameter("minimum", "20");
    Run(dispatcher, warmOnes);

    auto mistaken = Call({"room", "list"});
    mistaken->AddParameter("minimum", "400");
    mistaken->AddParameter("color", "red");
    Run(dispatcher, mistaken);

    Run(dispatcher, Call({"room", "paint"}));
}
