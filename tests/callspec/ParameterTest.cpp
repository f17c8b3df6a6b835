#include <tests/support/Split.h>
#include <tests/support/Thrown.h>
#include <zelmar/callspec/Output.h>
#include <zelmar/callspec/ParameterConstraint.h>
#include <zelmar/callspec/ParameterSpec.h>

#include <gtest/gtest.h>

#include <chrono>
#include <climits>

namespace CallSpec {
namespace {

using Texts = std::vector<std::string>;

Texts Complaints(const ParameterSpec& parameter, const Texts& values) {
    const auto output = Output::New();
    const bool valid = parameter.Validate(values, output);
    EXPECT_EQ(valid, !output->HasError());
    return output->GetErrors();
}

Texts Complaints(const ParameterConstraint& constraint, const std::string& value) {
    const auto output = Output::New();
    const bool valid = constraint.Validate(value, "p", output);
    EXPECT_EQ(valid, !output->HasError());
    return output->GetErrors();
}

std::shared_ptr<ParameterConstraint> Range(long min, long max) {
    auto range = ParameterConstraint::New(ConstraintTypeIntRange);
    range->SetIntRange(min, max);
    return range;
}

std::shared_ptr<ParameterConstraint> Regex(const std::string& expression) {
    auto regex = ParameterConstraint::New(ConstraintTypeStringRegex);
    regex->SetStringRegex(expression);
    return regex;
}

std::shared_ptr<ParameterConstraint> Speeds() {
    auto speeds = ParameterConstraint::New(ConstraintTypeStringEnum);
    speeds->AddStringEnum("slow", "takes its time");
    speeds->AddStringEnum("middling");
    speeds->AddStringEnum("fast", "in a hurry");
    return speeds;
}

TEST(Parameter, NamesAreSmallLettersDigitsAndHyphens) {
    for (const char* name : {"my-opt2", "9lives", "-", "x"}) {
        EXPECT_EQ(ParameterSpec::New(name, ParameterTypeInt)->GetName(), name);
    }
    for (const char* name : {"", "My-Opt", "a_b", "a b", "a\n"}) {
        EXPECT_EQ(Thrown([name] { (void)ParameterSpec::New(name, ParameterTypeInt); }),
                  std::string("Invalid Parameter name '") + name +
                      "' parameter names can only contain lower-case alphanumeric characters,"
                      " numbers and '-'");
    }
}

TEST(Parameter, ShortNamesAreOneLetterOrDigit) {
    const auto parameter = ParameterSpec::New("name", ParameterTypeInt);
    for (const char* shortName : {"x", "X", "7"}) {
        parameter->SetShortName(shortName);
    }
    for (const char* shortName : {"", "xy", "-", "\xe4"}) {
        EXPECT_EQ(Thrown([&] { parameter->SetShortName(shortName); }),
                  "Invalid value for shortName, must be a single character a-z, A-Z or 0-9");
    }
    EXPECT_EQ(parameter->GetShortName(), "7");
}

TEST(Parameter, OnlyAStringCanBeSecretAndOnlyAFittingConstraintStays) {
    const auto string = ParameterSpec::New("text", ParameterTypeString);
    EXPECT_TRUE(string->IsRequired() && !string->IsSecret());
    string->SetSecret(true);
    EXPECT_TRUE(string->IsSecret());
    const ParameterConstraintType kinds[] = {ConstraintTypeNone, ConstraintTypeIntRange,
                                             ConstraintTypeIntEnum, ConstraintTypeStringEnum,
                                             ConstraintTypeStringRegex};
    const std::string fits[] = {"...ss", ".ii..", ".....", ".....", "...ss", ".ii..", "....."};
    for (int type = ParameterTypeString; type <= ParameterTypeBoolList; ++type) {
        const auto parameter = ParameterSpec::New("text", static_cast<ParameterType>(type));
        EXPECT_EQ(parameter->AllowMultiple(), type > ParameterTypeFlag);
        EXPECT_EQ(
            Thrown([&] { parameter->SetSecret(false); }) == "Cannot be set for parameter text",
            type != ParameterTypeString);
        for (const auto kind : kinds) {
            const auto constraint = ParameterConstraint::New(kind);
            const std::string refusal = Thrown([&] { parameter->SetConstraint(constraint); });
            parameter->SetConstraint(nullptr);
            if (fits[type][kind] == '.') {
                EXPECT_EQ(refusal,
                          "Invalid constraint specified for parameter text.  The parameter"
                          " constraint specified is not allowed for a parameter of this type.");
                EXPECT_NE(parameter->GetConstraint(), constraint);
            } else {
                EXPECT_EQ(parameter->GetConstraint(), constraint);
            }
        }
    }
}

TEST(Parameter, ReadsIntegersAndTruthValues) {
    std::string read;
    auto texts = Split(
        "-5|+5|  5|\n5|007|| |12abc|5 |0x10|--5|-|1.0|99999999999999999999|"
        "-99999999999999999999",
        '|');
    texts.emplace_back("1\0", 2);
    for (const std::string& text : texts) {
        long number = 99;
        read += !ParameterSpec::GetInt(text, number) ? "?" : "=";
        read += std::to_string(number) + " ";
    }
    EXPECT_EQ(read,
              "=-5 =5 =5 =5 =7 ?99 ?99 ?99 ?99 ?99 ?99 ?99 ?99 =9223372036854775807"
              " =-9223372036854775808 ?99 ");
    read.clear();
    for (const auto& text :
         Split("1,yes,y,true,True,t,T,0,no,n,false,False,f,F,,TRUE,Yes,N, 1,2", ',')) {
        bool truth = false;
        read += !ParameterSpec::GetBool(text, truth) ? '?' : truth ? '1' : '0';
    }
    EXPECT_EQ(read, "11111110000000??????");
}

TEST(Parameter, JudgesAllValuesAndNamesAllFaults) {
    const std::string many =
        "Found multiple values for p this parameter can only accept a single"
        " value.";
    const std::string words =
        " expected one of [1, 0, y, n, true, false, True, False, yes, no, t,"
        " f, T, F]";
    const struct {
        ParameterType type;
        Texts values;
        Texts complaints;
    } cases[] = {
        {ParameterTypeString, {}, {"Missing value for parameter p"}},
        {ParameterTypeString, {""}, {}},
        {ParameterTypeString, {"a", "b"}, {many}},
        {ParameterTypeStringList, {"", "b"}, {}},
        {ParameterTypeInt, {"1"}, {}},
        {ParameterTypeInt, {""}, {"Invalid data '' for parameter p expected type Integer"}},
        {ParameterTypeInt,
         {"x", "y"},
         {many, "Invalid data 'x' for parameter p expected type Integer",
          "Invalid data 'y' for parameter p expected type Integer"}},
        {ParameterTypeIntList,
         {"1", "2x"},
         {"Invalid data '2x' for parameter p expected type"
          " Integer"}},
        {ParameterTypeBool, {"TRUE"}, {"Invalid data 'TRUE' for parameter p" + words}},
        {ParameterTypeBoolList, {"T", "F"}, {}},
        {ParameterTypeFlag, {""}, {}},
        {ParameterTypeFlag, {"", ""}, {many}},
        {ParameterTypeFlag,
         {"x"},
         {"Invalid data 'x' for parameter p.  This parameter is a flag and cannot accept any"
          " values. "}},
    };
    for (const auto& [type, values, complaints] : cases) {
        EXPECT_EQ(Complaints(*ParameterSpec::New("p", type), values), complaints);
    }
    const auto numbers = ParameterSpec::New("p", ParameterTypeIntList);
    numbers->SetConstraint(Range(1, 3));
    const std::string outside =
        "Invalid data constraint for parameter 'p'. Expected integer in the range 1-3";
    EXPECT_EQ(Complaints(*numbers, {"0", "x", "1", "4"}),
              Texts({outside, "Invalid data 'x' for parameter p expected type Integer", outside}));
}

TEST(Parameter, FillsTheFirstOfEachPlaceholder) {
    const auto expanded = [](const char* text, const std::shared_ptr<ParameterConstraint>& rule) {
        const auto parameter = ParameterSpec::New("p", ParameterTypeString);
        parameter->SetDescription(text);
        parameter->SetConstraint(rule);
        EXPECT_EQ(parameter->GetDescription(false), text);
        return parameter->GetDescription(true);
    };
    EXPECT_EQ(expanded("One of %ENUM%.", nullptr), "One of %ENUM%.");
    EXPECT_EQ(expanded("%ENUM% %ENUM% %REGEX%", Speeds()),
              "[slow, middling, fast] %ENUM% [slow, middling, fast]");
    EXPECT_EQ(expanded("%FULLENUM%", Speeds()),
              "\n    fast: in a hurry\n    slow: takes its time\n");
    EXPECT_EQ(expanded("<%FULLENUM%> %REGEX%", Regex("%ENUM%")),
              "<> a string matching the regular expression %ENUM%");
    EXPECT_EQ(expanded("<%FULLENUM%>", ParameterConstraint::New(ConstraintTypeStringEnum)), "<\n>");
}

TEST(Constraint, RangesIncludeTheirBounds) {
    EXPECT_EQ(Complaints(*Range(1, 10), "1"), Texts());
    EXPECT_EQ(Complaints(*Range(1, 10), "10"), Texts());
    EXPECT_EQ(Complaints(*Range(-5, -1), "0"),
              Texts({"Invalid data constraint for parameter 'p'. Expected integer in the range"
                     " -5--1"}));
    EXPECT_EQ(Complaints(*Range(1, 10), "x"),
              Texts({"Invalid data type for parameter 'p'. Expected an Integer"}));
    EXPECT_EQ(Complaints(*ParameterConstraint::New(ConstraintTypeIntRange), "0"), Texts());
    const auto range = Range(5, 5);
    EXPECT_EQ(Thrown([&] { range->SetIntRange(6, 5); }),
              "Invalid values for SetIntRange, constraints must have a min value <= max value");
    EXPECT_EQ(range->ToString(), "integer in the range 5-5");
}

TEST(Constraint, SetsKeepTheirOrderAndTakeNoMemberTwice) {
    const auto numbers = ParameterConstraint::New(ConstraintTypeIntEnum);
    EXPECT_EQ(Complaints(*numbers, "0"),
              Texts({"Invalid data constraint for parameter 'p'. Expected a single value from the"
                     " set []"}));
    numbers->AddIntEnum(3);
    numbers->AddIntEnum(-1);
    EXPECT_EQ(Thrown([&] { numbers->AddIntEnum(3); }),
              "Duplicate Value found in ParameterConstraint::AddIntEnum");
    EXPECT_EQ(numbers->ToString(), "[3, -1]");
    EXPECT_EQ(Complaints(*numbers, "-1"), Texts());
    const auto speeds = Speeds();
    EXPECT_EQ(Thrown([&] { speeds->AddStringEnum("fast", "otherwise"); }),
              "Duplicate Value found in ParameterConstraint::AddStringEnum: fast");
    EXPECT_EQ(
        speeds->GetStringEnumWithDesc(),
        (std::map<std::string, std::string>{{"fast", "in a hurry"}, {"slow", "takes its time"}}));
    EXPECT_EQ(Complaints(*speeds, "middling"), Texts());
    EXPECT_EQ(Complaints(*speeds, "Fast"),
              Texts({"Invalid data constraint for parameter 'p'. Expected a single value from the"
                     " set [slow, middling, fast] got 'Fast'"}));
}

TEST(Constraint, ExpressionsMatchTheWholeValue) {
    const auto refusal = [](const std::string& expression) {
        return Texts(
            {"Invalid data constraint for parameter 'p'. Value does not match the expected"
             " regular expression (" +
             expression + ")"});
    };
    EXPECT_EQ(Complaints(*Regex("[0-9]+"), "12a"), refusal("[0-9]+"));
    EXPECT_EQ(Complaints(*Regex("[0-9]+"), "12"), Texts());
    EXPECT_EQ(Complaints(*Regex("[0-9]+"), ""), refusal("[0-9]+"));
    EXPECT_EQ(Complaints(*Regex(".*"), ""), Texts());
    EXPECT_EQ(Complaints(*Regex("a|ab"), "ab"), Texts());
}

TEST(Constraint, AnExpressionThatCannotBeAppliedRefusesTheValue) {
    const auto start = std::chrono::steady_clock::now();
    for (const auto& [expression, value] : {std::pair<std::string, std::string>{"(", "a"},
                                            {"[z-a]", "a"},
                                            {"(a+)+$", std::string(40, 'a') + "b"}}) {
        const auto complaints = Complaints(*Regex(expression), value);
        ASSERT_EQ(complaints.size(), 1U);
        EXPECT_EQ(
            complaints[0].find("Invalid data constraint for parameter 'p'. Unable to apply the"
                               " regular expression (" +
                               expression + "): "),
            0U)
            << complaints[0];
    }
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(20));
}

TEST(Constraint, OtherKindsPassAllOrNothing) {
    const auto none = ParameterConstraint::New(ConstraintTypeNone);
    const auto unknown = ParameterConstraint::New(static_cast<ParameterConstraintType>(5));
    const auto output = Output::New();
    EXPECT_TRUE(none->Validate("x", "p", output));
    EXPECT_FALSE(unknown->Validate("x", "p", output));
    EXPECT_FALSE(output->HasError());
    EXPECT_EQ(none->ToString() + "," + unknown->ToString(), "no constraint,unknown");
}

}  // namespace
}  // namespace CallSpec
