#include <zelmar/callspec/Input.h>
#include <zelmar/callspec/InputSpec.h>
#include <zelmar/callspec/Output.h>
#include <zelmar/callspec/OutputSpec.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <gtest/gtest.h>

using MetaObj::MetaInt;
using MetaObj::MetaString;

namespace CallSpec {
namespace {

using Texts = std::vector<std::string>;

std::shared_ptr<ParameterSpec> Parameter(const char* name, ParameterType type,
                                         const char* shortName = nullptr) {
    auto parameter = ParameterSpec::New(name, type);
    if (shortName) {
        parameter->SetShortName(shortName);
    }
    return parameter;
}

std::shared_ptr<InputSpec> Declare(const std::vector<std::shared_ptr<ParameterSpec>>& parameters) {
    auto spec = InputSpec::New();
    for (const auto& parameter : parameters) {
        spec->AddParameter(parameter);
    }
    return spec;
}

std::shared_ptr<Input> Give(const std::vector<std::pair<std::string, std::string>>& values) {
    auto input = Input::New();
    for (const auto& [name, value] : values) {
        input->AddParameter(name, value);
    }
    return input;
}

Texts Complaints(const InputSpec& spec, const std::shared_ptr<Input>& input) {
    const auto output = Output::New();
    const bool valid = spec.Validate(input, output);
    EXPECT_EQ(valid, !output->HasError());
    return output->GetErrors();
}

TEST(Input, KeepsTheValuesOfAParameterInOrder) {
    const auto input = Give({{"x", "1"}, {"x", "2"}, {"flag", ""}});
    Texts values = {"0"};
    input->GetParameterList("x", values);
    input->GetParameterList("nosuch", values);
    EXPECT_EQ(values, Texts({"0", "1", "2"}));
    EXPECT_TRUE(input->HasParameter("flag") && input->IsFlagSet("flag"));
    EXPECT_FALSE(input->HasParameter("nosuch") || input->IsFlagSet("nosuch"));
    input->SetContext("user", "a");
    input->SetContext("user", "b");
    EXPECT_EQ(input->GetContext("user") + input->GetContext("nosuch"), "b");
}

TEST(Input, ReadsTypedValuesAndAbsenceInTheirPlace) {
    const auto input = Give({{"number", "12"},
                             {"truth", "T"},
                             {"ints", "1"},
                             {"ints", "x"},
                             {"ints", ""},
                             {"ints", "3"},
                             {"bools", "yes"},
                             {"bools", "FALSE"}});
    input->SetInputSpec(
        Declare({Parameter("number", ParameterTypeInt), Parameter("absent", ParameterTypeInt),
                 Parameter("truth", ParameterTypeBool), Parameter("lie", ParameterTypeBool)}));
    EXPECT_EQ(input->GetParameterInt("number"), 12);
    EXPECT_EQ(input->GetParameterInt("absent"), -1);
    EXPECT_EQ(input->GetParameterInt("truth"), -1);
    EXPECT_TRUE(input->GetParameterBool("truth"));
    EXPECT_FALSE(input->GetParameterBool("lie"));
    std::vector<long> ints = {7};
    input->GetParameterIntList("ints", ints);
    EXPECT_EQ(ints, std::vector<long>({7, 1, 3}));
    std::vector<bool> bools;
    input->GetParameterBoolList("bools", bools);
    EXPECT_EQ(bools, std::vector<bool>({true, false}));
    EXPECT_EQ(input->GetParameterListAsString("ints", ',', true), "\"1,x,,3\"");
    EXPECT_EQ(input->GetParameterListAsString("nosuch", ',', true), "\"\"");
    EXPECT_EQ(input->GetParameterListAsString("bools", '\n', false), "yes\nFALSE");
}

TEST(Input, ShortNamesAreFoldedBehindTheLongOnes) {
    const auto input = Give({{"f", "a"}, {"filter", "b"}, {"f", "c"}, {"z", "d"}});
    input->SetInputSpec(Declare(
        {Parameter("filter", ParameterTypeString, "f"), Parameter("plain", ParameterTypeString)}));
    EXPECT_EQ(input->GetParameters(),
              (std::map<std::string, Texts>{{"filter", {"b", "a", "c"}}, {"z", {"d"}}}));
}

TEST(InputSpec, SortsParameters) {
    const auto spec =
        Declare({Parameter("size", ParameterTypeInt, "s"), Parameter("name", ParameterTypeInt),
                 Parameter("path", ParameterTypeInt)});
    std::string names;
    for (const auto& parameter : spec->GetParameterSpecs()) {
        names += parameter->GetName() + " ";
    }
    EXPECT_EQ(names, "name path size ");
    spec->SetContextSupported("user");
    EXPECT_TRUE(spec->IsContextSupported("user") && !spec->IsContextSupported("User"));
}

TEST(InputSpec, ComplainsOfWhatIsGivenAndThenOfWhatIsMissing) {
    const auto spec =
        Declare({Parameter("mid", ParameterTypeString), Parameter("alpha", ParameterTypeInt, "a"),
                 Parameter("flag", ParameterTypeFlag), Parameter("help", ParameterTypeBool)});
    EXPECT_EQ(Complaints(*spec, Give({{"zeta", "1"}, {"alpha", "x"}, {"b", ""}, {"flag", ""}})),
              Texts({"Invalid data 'x' for parameter alpha expected type Integer",
                     "Unknown parameter : b", "Unknown parameter : zeta",
                     "Missing required parameter --help", "Missing required parameter --mid"}));
    EXPECT_EQ(Complaints(*InputSpec::New(), Give({{"zeta", "1"}})),
              Texts({"Unknown parameter : zeta"}));
    EXPECT_EQ(Complaints(*spec, Give({{"help", "x"}, {"zeta", "1"}, {"alpha", "x"}})), Texts());
}

TEST(OutputSpec, ChecksTheKindOfWhatWasDelivered) {
    const auto spec = OutputSpec::New();
    const auto output = Output::New();
    Texts errors;
    output->SetRootObject(MetaInt::New(1));
    EXPECT_FALSE(spec->Validate(output, &errors));
    spec->SetRootObject(MetaString::New());
    EXPECT_FALSE(spec->Validate(output, &errors));
    EXPECT_FALSE(spec->Validate(Output::New(), &errors));
    EXPECT_FALSE(spec->Validate(Output::New(), nullptr));
    output->SetRootObject(MetaString::New("x"));
    EXPECT_TRUE(spec->Validate(output, &errors));
    EXPECT_EQ(errors,
              Texts({"No root object set for output spec. Root object for output spec must be set"
                     " for proper validation of output.",
                     "Type mismatch in structure.  Expecting String got Int",
                     "No root object set for output. The command did not provide proper output."}));
    EXPECT_EQ(spec->GetDescription(), "Documentation missing");
}

}  // namespace
}  // namespace CallSpec
