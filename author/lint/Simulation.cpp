// A value is a mark, a probe and the end of a mark. What becomes of the probe shows the treatment;
// then it is taken out, and an inconspicuous word is left for the shell to read.

#include <author/lint/Simulation.h>

#include <algorithm>
#include <charconv>
#include <utility>

namespace Author {

namespace {

constexpr size_t mostPaired = 20;
// Longer than what mkdtemp(3) makes up, so that the path of no temporary folder holds one.
constexpr std::string_view markBegin = "Zqvalue";
constexpr std::string_view markEnd = "eulavqZ";
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

// The number in a mark that begins at `begin`, behind its first word; `end` moves behind the mark.
size_t ReadMark(std::string_view text, size_t begin, size_t& end) {
    size_t number = 0;
    const char* first = text.data() + begin + markBegin.size();
    end = static_cast<size_t>(std::from_chars(first, text.data() + text.size(), number).ptr -
                              text.data() + 1);
    return number;
}

// Takes the probes out of the text.
void ReadProbes(const DeclaredCommand& command, Expansion& expansion) {
    const std::string text = std::exchange(expansion.text, "");
    size_t done = 0;
    for (size_t begin = text.find(markBegin); begin != std::string::npos;
         begin = text.find(markBegin, done)) {
        size_t left = 0;
        const size_t number = ReadMark(text, begin, left);
        const size_t end = text.find(markEnd, left);
        if (number >= command.parameters.size() || end == std::string::npos) {
            break;  // the template has the mark itself
        }
        expansion.text.append(text, done, begin - done);
        expansion.occurrences.push_back({&command.parameters[number], expansion.text.size(),
                                         TreatmentOf(text.substr(left, end - left))});
        expansion.text.append(text, begin, left - begin);
        done = end;
    }
    expansion.text.append(text, done);
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
    std::string readable;
    size_t done = 0;
    for (size_t begin = text.find(markBegin); begin != std::string::npos;
         begin = text.find(markBegin, done)) {
        size_t end = 0;
        const size_t number = ReadMark(text, begin, end);
        if (number >= command.parameters.size() ||
            text.compare(end, markEnd.size(), markEnd) != 0) {
            break;
        }
        readable.append(text, done, begin - done);
        readable += "<" + command.parameters[number].spec->GetName() + ">";
        done = end + markEnd.size();
    }
    return readable.append(text, done);
}

}  // namespace Author
