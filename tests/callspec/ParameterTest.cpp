#include <tests/support/Split.h>
#include <tests/support/Thrown.h>
#include <zelmar/callspec/Output.h>
#include <zelmar/callspec/ParameterSpec.h>

#include <gtest/gtest.h>

#include <chrono>
#include <set>

namespace CallSpec {
namespace {

using Texts = std::vector<std::string>;

// What is said of the values, one a line; nothing when they are accepted.
template <class Judge>
std::string Complaints(Judge judge) {
    const auto output = Output::New();
    const bool valid = judge(output);
    EXPECT_EQ(valid, !output->HasError());
    std::string told;
    for (const std::string& error : output->GetErrors()) {
        told += error + "\n";
    }
    return told;
}

std::string Complaints(const ParameterConstraint& constraint, const std::string& value) {
    return Complaints([&](const auto& output) { return constraint.Validate(value, "p", output); });
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

std::shared_ptr<ParameterConstraint> Numbers(const std::vector<long>& members) {
    auto numbers = ParameterConstraint::New(ConstraintTypeIntEnum);
    for (const long member : members) {
        numbers->AddIntEnum(member);
    }
    return numbers;
}

std::shared_ptr<ParameterConstraint> Speeds() {
    auto speeds = ParameterConstraint::New(ConstraintTypeStringEnum);
    speeds->AddStringEnum("slow", "takes its time");
    speeds->AddStringEnum("middling");
    speeds->AddStringEnum("fast", "in a hurry");
    return speeds;
}

// Who may be a secret and have several values, and which kinds of constraint stay.
TEST(Parameter, TakesWhatFitsItsType) {
    const char* const fits[] = {"s---ss", "--ii--", "------", "------",
                                "-m--ss", "-mii--", "-m----"};
    std::set<std::string> refusals = {""};
    for (int type = ParameterTypeString; type <= ParameterTypeBoolList; ++type) {
        const auto parameter = ParameterSpec::New("9-x", static_cast<ParameterType>(type));
        const bool secret = Thrown([&] { parameter->SetSecret(true); }) == Thrown([] {});
        EXPECT_EQ(parameter->IsSecret(), secret);
        std::string told = secret ? "s" : "-";
        told += parameter->AllowMultiple() ? "m" : "-";
        for (int kind = ConstraintTypeIntRange; kind <= ConstraintTypeStringRegex; ++kind) {
            const auto constraint =
                ParameterConstraint::New(static_cast<ParameterConstraintType>(kind));
            const std::string refusal = Thrown([&] { parameter->SetConstraint(constraint); });
            const bool stays = parameter->GetConstraint() == constraint;
            told += !stays ? "-" : kind < 3 ? "i" : "s";
            refusals.insert(stays ? "" : refusal);
            parameter->SetConstraint(nullptr);
        }
        EXPECT_EQ(told, fits[type]) << type;
        EXPECT_THROW(parameter->SetConstraint(ParameterConstraint::New(ConstraintTypeNone)),
                     Zelmar::ZelmarException);
    }
    EXPECT_EQ(refusals,
              std::set<std::string>({"",
                                     "Invalid constraint specified for parameter 9-x.  The"
                                     " parameter constraint specified is not allowed for a"
                                     " parameter of this type."}));
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
        "Found multiple values for p this parameter can only accept a single value.\n";
    const auto noInteger = [](const std::string& value) {
        return "Invalid data '" + value + "' for parameter p expected type Integer\n";
    };
    const std::string outside =
        "Invalid data constraint for parameter 'p'. Expected integer in the range 1-3\n";
    const struct {
        ParameterType type;
        Texts values;
        std::string complaints;
        std::shared_ptr<ParameterConstraint> constraint = nullptr;
    } cases[] = {
        {ParameterTypeString, {}, "Missing value for parameter p\n"},
        {ParameterTypeString, {""}, ""},
        {ParameterTypeString, {"a", "b"}, many},
        {ParameterTypeStringList, {"", "b"}, ""},
        {ParameterTypeInt, {"1"}, ""},
        {ParameterTypeInt, {""}, noInteger("")},
        {ParameterTypeInt, {"x", "y"}, many + noInteger("x") + noInteger("y")},
        {ParameterTypeIntList,
         {"0", "x", "1", "4"},
         outside + noInteger("x") + outside,
         Range(1, 3)},
        {ParameterTypeBool,
         {"TRUE"},
         "Invalid data 'TRUE' for parameter p expected one of [1, 0, y, n, true, false, True,"
         " False, yes, no, t, f, T, F]\n"},
        {ParameterTypeBoolList, {"T", "F"}, ""},
        {ParameterTypeFlag, {""}, ""},
        {ParameterTypeFlag, {"", ""}, many},
        {ParameterTypeFlag,
         {"x"},
         "Invalid data 'x' for parameter p.  This parameter is a flag and cannot accept any"
         " values. \n"},
    };
    for (const auto& row : cases) {
        const auto parameter = ParameterSpec::New("p", row.type);
        parameter->SetConstraint(row.constraint);
        const auto judge = [&](const auto& output) {
            return parameter->Validate(row.values, output);
        };
        EXPECT_EQ(Complaints(judge), row.complaints);
    }
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

TEST(Constraint, AcceptsItsMembersAndTellsOfThemOtherwise) {
    const std::string head = "Invalid data constraint for parameter 'p'. ";
    const std::string noMatch = "Value does not match the expected regular expression ([0-9]+)";
    const struct {
        std::shared_ptr<ParameterConstraint> constraint;
        Texts accepted, refused;
        std::string complaint;
    } cases[] = {
        {Range(1, 10), {"1", "10"}, {"0", "11"}, "Expected integer in the range 1-10"},
        {Range(-5, -1), {"-5", "-1"}, {"0"}, "Expected integer in the range -5--1"},
        {ParameterConstraint::New(ConstraintTypeIntRange),
         {"0"},
         {"1"},
         "Expected integer in the range 0-0"},
        {Numbers({}), {}, {"0"}, "Expected a single value from the set []"},
        {Numbers({3, -1}), {"3", "-1"}, {"0"}, "Expected a single value from the set [3, -1]"},
        {Speeds(),
         {"middling"},
         {"Fast"},
         "Expected a single value from the set [slow, middling, fast] got 'Fast'"},
        {Regex("[0-9]+"), {"12"}, {"12a", "", "x1"}, noMatch},
        {Regex("a|ab"), {"ab"}, {}, ""},
        {Regex(".*"), {""}, {}, ""},
        {ParameterConstraint::New(ConstraintTypeNone), {"x"}, {}, ""},
    };
    for (const auto& [constraint, accepted, refused, complaint] : cases) {
        for (const std::string& value : accepted) {
            EXPECT_EQ(Complaints(*constraint, value), "") << value;
        }
        for (const std::string& value : refused) {
            EXPECT_EQ(Complaints(*constraint, value), head + complaint + "\n") << value;
        }
    }
    EXPECT_EQ(Complaints(*Range(1, 10), "x"),
              "Invalid data type for parameter 'p'. Expected an Integer\n");
    const auto unknown = ParameterConstraint::New(static_cast<ParameterConstraintType>(5));
    EXPECT_FALSE(unknown->Validate("x", "p", Output::New()));
    EXPECT_EQ(ParameterConstraint::New(ConstraintTypeNone)->ToString() + unknown->ToString(),
              "no constraintunknown");
}

TEST(Constraint, AnExpressionThatCannotBeAppliedRefusesTheValue) {
    const auto start = std::chrono::steady_clock::now();
    for (const auto& [expression, value] : {std::pair<std::string, std::string>{"(", "a"},
                                            {"[z-a]", "a"},
                                            {"(a+)+$", std::string(40, 'a') + "b"}}) {
        const std::string head =
            "Invalid data constraint for parameter 'p'. Unable to apply the regular expression (" +
            expression + "): ";
        EXPECT_EQ(Complaints(*Regex(expression), value).substr(0, head.size()), head);
    }
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(20));
}

}  // namespace
}  // namespace CallSpec
