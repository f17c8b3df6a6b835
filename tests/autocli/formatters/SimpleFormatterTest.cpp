#include <tests/support/AllStrings.h>
#include <zelmar/autocli/formatters/SimpleFormatter.h>

#include <gtest/gtest.h>

#include <boost/algorithm/string/replace.hpp>
#include <boost/regex.hpp>
#include <sstream>

#include "Values.h"

using MetaObj::MetaStruct;

namespace AutoCli {

namespace {

FormatParameters Parameters(const std::map<std::string, std::string>& entries) {
    FormatParameters parameters;
    for (const auto& [key, value] : entries) {
        parameters.SetParameter(key, value);
    }
    return parameters;
}

std::string TextOf(const Value& value, FormatParameters parameters, int level = 0) {
    std::ostringstream text;
    SimpleFormatter().Format(value, parameters, text, level);
    return text.str();
}

std::shared_ptr<MetaStruct> Device() {
    auto detail = MetaStruct::New("Detail");
    detail->SetField("Size", 1);
    auto device = MetaStruct::New("Device");
    device->SetField("Info", detail);
    device->SetField("Name", "sda");
    device->SetField("Paths", std::vector<std::string>{"a", "b"});
    return device;
}

}  // namespace

TEST(SimpleFormatter, ParametersShapeStructs) {
    struct Row {
        std::map<std::string, std::string> parameters;
        const char* text;
    };
    const Row rows[] = {
        {{}, "Device:\n   Info: \n      Detail:\n         Size: 1\n   Name: sda\n   Paths: a, b\n"},
        {{{"align-fields", "true"}},
         "Device:\n   Info : \n      Detail:\n         Size: 1\n   Name : sda\n   Paths: a, b\n"},
        {{{"align-fields", "yes"}, {"fields", "Name"}}, "Device:\n   Name: sda\n"},
        {{{"header:Device", "<NONE>"}, {"fields:Device", "Paths,Name"}},
         "   Paths: a, b\n   Name: sda\n"},
        {{{"header:Device", "Device %Name%"}, {"fields", "Name"}}, "Device sda:\n   Name: sda\n"},
        // A field that is absent ends its struct, and only that.
        {{{"fields:Device", "Info,Name"}, {"fields:Detail", "Nope,Size"}},
         "Device:\n   Info: \n      Detail:\nError getting field Nope\n   Name: sda\n"},
        {{{"fields:Device", "Name"}, {"fields", "Info"}}, "Device:\n   Name: sda\n"},
        {{{"fields", "Name, Paths"}}, "Device:\n   Name: sda\nError getting field  Paths\n"},
        {{{"fields", ""}, {"align-fields", "true"}}, "Device:\n"},
        {{{"fields", "Info"},
          {"fields:Detail", "Size"},
          {"printf:Detail.Size", "%03ld"},
          {"units:Detail.Size", "Mb"}},
         "Device:\n   Info: \n      Detail:\n         Size: 001 Mb\n"},
        // Neither reaches a list: they are for scalars.
        {{{"fields", "Paths"}, {"units:Device.Paths", "Mb"}, {"printf:Device.Paths", "%s"}},
         "Device:\n   Paths: a, b\n"},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(TextOf(Device(), Parameters(row.parameters)), row.text);
    }
}

TEST(SimpleFormatter, LevelsIndent) {
    auto list = MetaObj::MetaList::New(MetaObj::MetaType::Struct, Device());
    list->Add(Device());
    EXPECT_EQ(TextOf(list, Parameters({{"fields", "Name"}}), 1),
              "\n      Device:\n         Name: sda\n\n");
}

// The last percent sign closes the tag, and the last one that leaves room for a name opens it: as
// the greedy expression says, for all headings of up to seven characters.
TEST(SimpleFormatter, HeadingTakesTheLastTag) {
    const boost::regex expression(".*%(.+)%.*");
    auto value = MetaStruct::New("T");
    for (const char* name : {"%", "a", "\n", "a%", "%a", "aa", "%%", "a%a"}) {
        value->SetField(name, "<" + std::string(name) + ">");
    }
    ForEachString("%a\n", 7, [&](const std::string& heading) {
        std::string expected = heading;
        boost::smatch match;
        if (boost::regex_match(heading, match, expression) && value->HasField(match[1])) {
            boost::algorithm::replace_all(expected, "%" + match[1] + "%",
                                          value->GetField(match[1])->ToString());
        }
        EXPECT_EQ(TextOf(value, Parameters({{"header:T", heading}, {"fields", ""}})),
                  expected + ":\n");
    });
}

TEST(SimpleFormatter, ANullStructOrListIsAnErrorLine) {
    FormatParameters parameters;
    std::ostringstream text;
    SimpleFormatter().FormatStruct(nullptr, parameters, text, 1);
    SimpleFormatter().FormatList(nullptr, parameters, text, 1);
    SimpleFormatter().Format(nullptr, parameters, text, 1);
    EXPECT_EQ(text.str(), "Error reading a struct from output.\nError reading a List\n");
}

}  // namespace AutoCli
