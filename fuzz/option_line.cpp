// A line of a command file, through both phases of the parser and the judgement of its values.

#include <zelmar/autocli/OptionParser.h>
#include <zelmar/callspec/Input.h>
#include <zelmar/callspec/InputSpec.h>
#include <zelmar/callspec/Output.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <iostream>
#include <sstream>

using CallSpec::InputSpec;
using CallSpec::ParameterSpec;

namespace {

// One parameter of each type, the string a secret.
std::shared_ptr<InputSpec> Declaration() {
    auto spec = InputSpec::New();
    const char* const names[] = {"string", "int", "bool", "flag", "strings", "ints", "bools"};
    for (int type = CallSpec::ParameterTypeString; type <= CallSpec::ParameterTypeBoolList;
         ++type) {
        auto parameter =
            ParameterSpec::New(names[type], static_cast<CallSpec::ParameterType>(type));
        parameter->SetRequired(false);
        parameter->SetShortName(std::string(1, static_cast<char>('a' + type)));
        if (type == CallSpec::ParameterTypeString) {
            parameter->SetSecret(true);
        }
        spec->AddParameter(parameter);
    }
    return spec;
}

void Require(bool holds) {
    if (!holds) {
        std::abort();
    }
}

// What the line said must not depend on how its words are told apart.
void RequireSameWords(const std::string& line, const AutoCli::OptionParser& parser) {
    AutoCli::OptionParser padded;
    Require(!padded.ParseString(" \t" + line));
    Require(padded.GetCommandPath() == parser.GetCommandPath());
    Require(padded.GetDispatcherParameters() == parser.GetDispatcherParameters());
    Require(std::ranges::none_of(parser.GetCommandPath(), &AutoCli::OptionParser::IsParameter));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const std::ostringstream hidden;
    static const auto spec = Declaration();
    std::cin.rdbuf(hidden.rdbuf());
    std::cout.rdbuf(hidden.rdbuf());
    const std::string line(reinterpret_cast<const char*>(data), size);
    AutoCli::OptionParser parser;
    if (parser.ParseString(line)) {
        Require(parser.ToString() == AutoCli::OptionParser().ToString());
        return 0;
    }
    RequireSameWords(line, parser);
    parser.SetInputSpec(spec);
    const auto input = CallSpec::Input::New();
    for (const auto& [name, value] : parser.GetCommandParameters()) {
        input->AddParameter(name, value);
    }
    const auto output = CallSpec::Output::New();
    input->SetInputSpec(spec);
    Require(spec->Validate(input, output) == !output->HasError());
    return 0;
}
