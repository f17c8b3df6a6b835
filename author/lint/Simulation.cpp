// A value is a mark, a probe and the end of a mark. What becomes of the probe shows the treatment;
// then it is taken out, and an inconspicuous word is left for the shell to read.

#include <author/lint/Simulation.h>

#include <algorithm>

namespace Author {

namespace {

constexpr size_t mostPaired = 20;
constexpr std::string_view markBegin = "Zq";
constexpr std::string_view markEnd = "qZ";
constexpr std::string_view probe = ";'\"";

std::string MarkOf(size_t parameter, char value) {
    return std::string(markBegin) + std::to_string(parameter) + value;
}

Treatment TreatmentOf(std::string_view left) {
    return left == probe   ? Treatment::Unchanged
           : left == ";\"" ? Treatment::WithoutSingleQuotes
           : left == ";'"  ? Treatment::WithoutDoubleQuotes
                           : Treatment::Escaped;
}

// Takes the probes out of the text.
void ReadProbes(const DeclaredCommand& command, Expansion& expansion) {
    std::string& text = expansion.text;
    for (size_t i = 0; i < command.parameters.size(); ++i) {
        for (const char value : {'a', 'b'}) {
            const std::string mark = MarkOf(i, value);
            for (size_t at = text.find(mark); at != std::string::npos;
                 at = text.find(mark, at + 1)) {
                const size_t begin = at + mark.size();
                const size_t end = text.find(markEnd, begin);
                if (end == std::string::npos) {
                    break;
                }
                expansion.occurrences.push_back(
                    {&command.parameters[i], at, TreatmentOf(text.substr(begin, end - begin))});
                text.erase(begin, end - begin);
                for (Occurrence& other : expansion.occurrences) {
                    other.place -= other.place > at ? end - begin : 0;
                }
            }
        }
    }
}

void Give(const DeclaredCommand& command, size_t index, CallSpec::Input& input, Given& expected) {
    const CallSpec::ParameterSpec& spec = *command.parameters[index].spec;
    if (spec.GetType() == CallSpec::ParameterTypeFlag) {
        input.AddParameter(spec.GetName(), "");
        expected[spec.GetName()] = {""};
        return;
    }
    for (const char value : {'a', 'b'}) {
        const std::string mark = MarkOf(index, value);
        input.AddParameter(spec.GetName(), mark + std::string(probe) + std::string(markEnd));
        expected[spec.GetName()].push_back(mark + std::string(markEnd));
        if (!spec.AllowMultiple()) {
            break;
        }
    }
}

// The sets of optional parameters to try, by their places.
std::vector<std::vector<size_t>> Combinations(const std::vector<size_t>& optional) {
    std::vector<std::vector<size_t>> sets = {{}};
    for (const size_t one : optional) {
        sets.push_back({one});
    }
    const size_t paired = std::min(optional.size(), mostPaired);
    for (size_t one = 0; one < paired; ++one) {
        for (size_t other = one + 1; other < paired; ++other) {
            sets.push_back({optional[one], optional[other]});
        }
    }
    if (optional.size() > 2) {
        sets.push_back(optional);
    }
    return sets;
}

}  // namespace

std::vector<Expansion> Simulate(const DeclaredCommand& command, const Template& read,
                                bool isStdin) {
    std::vector<size_t> optional;
    for (size_t i = 0; i < command.parameters.size(); ++i) {
        if (!command.parameters[i].spec->IsRequired()) {
            optional.push_back(i);
        }
    }
    std::vector<Expansion> expansions;
    try {
        for (const auto& set : Combinations(optional)) {
            auto input = CallSpec::Input::New();
            Given given;
            Expansion expansion;
            for (size_t i = 0; i < command.parameters.size(); ++i) {
                const bool isOptional = !command.parameters[i].spec->IsRequired();
                if (isOptional && std::ranges::find(set, i) == set.end()) {
                    continue;
                }
                Give(command, i, *input, given);
                if (isOptional) {
                    expansion.options.push_back(command.parameters[i].spec->GetName());
                }
            }
            input->SetInputSpec(command.command->GetInputSpecInternal());
            expansion.text = command.command->SubstituteInput(input, isStdin);
            expansion.expected = Expand(read.nodes, given, isStdin, expansion.left);
            ReadProbes(command, expansion);
            expansions.push_back(std::move(expansion));
        }
    } catch (const Zelmar::ZelmarException&) {
        return {};  // a form that does not fit its parameter, of which another rule tells
    }
    return expansions;
}

std::string Readable(const std::string& text, const DeclaredCommand& command) {
    std::string readable = text;
    for (size_t i = 0; i < command.parameters.size(); ++i) {
        for (const char value : {'a', 'b'}) {
            const std::string mark = MarkOf(i, value) + std::string(markEnd);
            for (size_t at = readable.find(mark); at != std::string::npos;
                 at = readable.find(mark, at)) {
                readable.replace(at, mark.size(),
                                 "<" + command.parameters[i].spec->GetName() + ">");
            }
        }
    }
    return readable;
}

}  // namespace Author
