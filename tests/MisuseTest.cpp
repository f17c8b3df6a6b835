// What is thrown at a caller who uses an interface wrongly, to the letter.

#include <tests/support/TestCommand.h>
#include <tests/support/Thrown.h>
#include <zelmar/autocli/Namespace.h>
#include <zelmar/autocli/extension/ExtensionCommand.h>
#include <zelmar/metaobj/MetaList.h>

#include <gtest/gtest.h>

using CallSpec::Input;
using CallSpec::InputSpec;
using CallSpec::OutputSpec;
using CallSpec::ParameterConstraint;
using CallSpec::ParameterSpec;
using MetaObj::MetaInt;
using MetaObj::MetaList;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

namespace AutoCli {
namespace {

using Cases = std::vector<std::pair<std::function<void()>, std::string>>;

void ExpectThrown(const Cases& cases) {
    for (const auto& [call, message] : cases) {
        EXPECT_EQ(Thrown(call), message);
    }
}

std::shared_ptr<MetaStruct> Pair() {
    auto pair = MetaStruct::New("T");
    pair->SetField("a", 1);
    pair->SetField("b", 2);
    return pair;
}

TEST(Misuse, OfValues) {
    const auto pair = Pair();
    const auto rows = MetaList::New(MetaType::Struct, pair);
    const auto locked = Pair();
    locked->LockStructure();
    const auto half = Pair();
    half->RemoveField("b");
    const auto instance = MetaStruct::New(Pair());
    const std::string badName = "Invalid name specified for MetaStruct: ";
    ExpectThrown({
        {[] { MetaStruct::New(""); }, badName},
        {[] { MetaStruct::New("a_b"); }, badName + "a_b"},
        {[] { MetaStruct::New("a\n"); }, badName + "a\n"},
        {[] { MetaStruct::New("\xc3\xa4"); }, badName + "\xc3\xa4"},
        {[&] { (void)pair->GetFieldDocumentation("x"); },
         "Field x is not present in the structure T"},
        {[&] { locked->SetField("x", std::shared_ptr<MetaInt>()); },
         "Invalid NULL value was assigned to the field x in the structure T"},
        {[&] { locked->SetField("x", 1); },
         "Unable to set new field x on structure. Structure has been locked"},
        {[&] { locked->RemoveField("x"); }, "Structure is locked, unable to remove fields"},
        {[&] { instance->SetField("x", 1); },
         "Unable to set new field x on structure.  The field does not match the Structure"
         " definition for this MetaStruct."},
        // The shape of a list and the definition of a struct are frozen.
        {[&] { pair->SetField("x", 1); },
         "Unable to set new field x on structure. Structure has been locked"},
        {[&] { instance->GetStructureDefinition()->SetField("x", 1); },
         "Unable to set new field x on structure. Structure has been locked"},
        {[] { MetaList::New(MetaType::Struct); },
         "Integer, boolean or string type expected for list."},
        {[] { MetaList::New(MetaType::List); },
         "Integer, boolean or string type expected for list."},
        {[] { MetaList(MetaType::List, MetaObj::MetaObject::FactoryFlag()); },
         "Integer, boolean or string type expected for list."},
        {[] { MetaList(MetaType::List, nullptr, MetaObj::MetaObject::FactoryFlag()); },
         "Struct type expected for list."},
        {[&] { MetaList::New(MetaType::Int, pair); }, "Struct type expected for list."},
        {[&] { MetaList::New(MetaType::List, pair); }, "Struct type expected for list."},
        {[&] { rows->Add(std::shared_ptr<MetaStruct>()); }, "Null object passed to Add"},
        {[&] { rows->Add(half); },
         "Invalid structure detected by MetaList::Add.  Type Errors were: (3) : Mismatch on number"
         " of fields set in struct. Expected 2 found 1, Missing field in input: b, There was an"
         " error adding an item to this list.  The item being added did not match the declared"
         " structure of this list, so it was not added."},
        {[&] { MetaList::New(MetaType::Struct, MetaInt::New(1))->Add(pair); },
         "Invalid structure detected by MetaList::Add.  Type Errors were: (1) : List created with"
         " NULL structure.  No items can be added to this list."},
        {[] { MetaList::New(MetaType::Bool)->Add(1); },
         "Invalid type specificed in MetaList.  Expected object of type Bool got object of type"
         " Int"},
        {[&] { (void)rows->GetItem(0); }, "Get requested on invalid index of MetaList"},
        {[&] { rows->Delete(0); }, "Delete requested on invalid index of MetaList"},
    });
    EXPECT_THROW((void)pair->GetFieldType("x"), int);
    EXPECT_EQ(rows->GetCount() + half->GetFieldNames().size(), 1U);
    EXPECT_EQ(pair->ToString() + locked->ToString(),
              "{'a' => '1', 'b' => '2', }{'a' => '1', 'b' => '2', }");
}

std::shared_ptr<ParameterSpec> Named(const char* name, const char* shortName = nullptr,
                                     CallSpec::ParameterType type = CallSpec::ParameterTypeInt) {
    auto parameter = ParameterSpec::New(name, type);
    if (shortName) {
        parameter->SetShortName(shortName);
    }
    return parameter;
}

TEST(Misuse, OfDeclarations) {
    const auto words = ParameterConstraint::New(CallSpec::ConstraintTypeStringEnum);
    const auto numbers = ParameterConstraint::New(CallSpec::ConstraintTypeIntEnum);
    words->AddStringEnum("fast", "in a hurry");
    numbers->AddIntEnum(3);
    const auto range = ParameterConstraint::New(CallSpec::ConstraintTypeIntRange);
    range->SetIntRange(5, 5);
    const auto spec = InputSpec::New();
    spec->AddParameter(Named("size", "s"));
    spec->AddParameter(Named("flag", "f", CallSpec::ParameterTypeFlag));
    spec->AddParameter(Named("list", "l", CallSpec::ParameterTypeIntList));
    const auto input = Input::New();
    const auto undeclared = Input::New();
    undeclared->AddParameter("size", "1");
    input->SetInputSpec(spec);
    const std::string badName = "Invalid Parameter name '";
    const std::string nameRule =
        "' parameter names can only contain lower-case alphanumeric characters, numbers and '-'";
    const std::string shortRule =
        "Invalid value for shortName, must be a single character a-z, A-Z or 0-9";
    const std::string duplicate =
        "Found a duplicate paramater specification for parameter named 'size'";
    ExpectThrown({
        {[] { Named(""); }, badName + nameRule},
        {[] { Named("My-opt"); }, badName + "My-opt" + nameRule},
        {[] { Named("a_b"); }, badName + "a_b" + nameRule},
        {[] { Named("a\n"); }, badName + "a\n" + nameRule},
        {[] { Named("aa", ""); }, shortRule},
        {[] { Named("aa", "xy"); }, shortRule},
        {[] { Named("aa", "-"); }, shortRule},
        {[] { Named("aa", "\xe4"); }, shortRule},
        {[] { Named("aa")->SetSecret(false); }, "Cannot be set for parameter aa"},
        {[&] { range->SetIntRange(6, 5); },
         "Invalid values for SetIntRange, constraints must have a min value <= max value"},
        {[&] { numbers->AddIntEnum(3); },
         "Duplicate Value found in ParameterConstraint::AddIntEnum"},
        {[&] { words->AddStringEnum("fast", "again"); },
         "Duplicate Value found in ParameterConstraint::AddStringEnum: fast"},
        {[&] { spec->AddParameter(Named("x")); }, "Parameter name must be at least 2 characters"},
        {[&] { spec->AddParameter(Named("size")); }, duplicate},
        {[&] { spec->AddParameter(Named("size", "s")); }, duplicate},
        {[&] { spec->AddParameter(Named("sign", "s")); },
         "Invalid short name specified for --sign. The short name -s is already used for --size"},
        {[] { OutputSpec::New()->SetRootObject(std::shared_ptr<MetaInt>()); },
         "Root object cannot be set to null"},
        {[&] { (void)undeclared->GetParameter("size"); }, "Request for unknown parameter: size"},
        {[&] { (void)input->GetParameter("s"); }, "Request for unknown parameter: s"},
        {[&] { (void)input->GetParameter("flag"); },
         "Request for GetParameter on a flag type parameter: flag"},
        {[&] { (void)input->GetParameter("list"); },
         "Request for GetParameter on a parameter that can have multiple values: list"},
        {[] { ExtensionCommand::New()->GetInputSpec(); },
         "Request for NULL InputSpec.  Extension command is incomplete and will not work"},
        {[] { ExtensionCommand::New()->GetOutputSpec(); },
         "Request for NULL OutputSpec.  Extension command is incomplete and will not work"},
    });
    EXPECT_EQ(range->ToString() + numbers->ToString() + words->ToString(),
              "integer in the range 5-5[3][fast]");
    EXPECT_EQ(words->GetStringEnumWithDesc().at("fast"), "in a hurry");
}

struct Undeclared : TestCommand {
    Undeclared() : TestCommand(Answer, {}) {}
    std::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal() override { return nullptr; }
    std::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal() override { return nullptr; }
};

TEST(Misuse, OfTheTree) {
    const auto root = RootNamespace::New(nullptr);
    const auto a = root->SubNamespace("a");
    const auto command = TestCommand::New();
    a->RegisterNamespaceNode(command, "cmd");
    const auto loose = Namespace::New();
    const auto lost = TestCommand::New();
    loose->SetName("free");
    loose->RegisterNamespaceNode(lost, "cmd");
    const auto undeclared = std::make_shared<Undeclared>();
    root->SubNamespace("b")->RegisterNamespaceNode(undeclared, "cmd");
    const std::string rule =
        ", must be a name consisting of letters and numbers and must conform to 'camel' casing.";
    const std::string below = " Commands cannot have sub-commands or sub-namespaces.";
    const std::string orphan =
        ": Invalid state for Namespace Node with the name 'free' No parent node has been set";
    ExpectThrown({
        {[&] { loose->SetName("C"); }, "Invalid name for namespace 'C'" + rule},
        {[&] { a->RegisterNamespaceNode(nullptr, "cmd"); },
         "Duplicate registration in namespace a attempt to register two objects with name cmd"},
        {[&] { a->RegisterNamespaceNode(nullptr, "c"); },
         "Null namespace node named 'c' passed to namespace a"},
        {[&] { a->RegisterNamespaceNode(TestCommand::New(), "C"); },
         "Invalid name for namespace 'C'" + rule},
        {[&] { (void)command->GetNamespaceNode("x"); },
         "Unable to find a namespace or command with the name 'x' on the command 'a cmd'." + below},
        {[&] { (void)command->SubNamespace("x"); },
         "Unable to find a namespace or command with the name 'x' on the command 'a cmd'." + below},
        {[&] { command->RegisterNamespaceNode(nullptr, "x"); },
         "Attempt to register a command or namespace 'x' on command 'a cmd'." + below},
        {[&] { (void)lost->GetPath(); }, "GetPath" + orphan},
        {[&] { (void)lost->GetPathString(' '); }, "GetPathString" + orphan},
        {[&] { (void)lost->GetDispatcher(); },
         "Invalid state for namespace 'freeno parent has been set while attempting to get"
         " dispathcer reference."},
        {[] { (void)TestCommand::New()->GetDispatcher(); },
         "Invalid state for command with name ''. No parent node has been set."},
        {[&] { undeclared->GetInputSpec(); }, "The command 'b cmd' declares no input"},
        {[&] { undeclared->GetOutputSpec(); }, "The command 'b cmd' declares no output"},
        {[&] { root->SetParent(a); }, "Error, Root namespace cannot be assigned a parent node"},
    });
    EXPECT_EQ(a->GetNamespaceNodeNames(), std::vector<std::string>({"cmd"}));
    EXPECT_EQ(loose->GetName(), "free");
}

}  // namespace
}  // namespace AutoCli
