// The parameters of operations, and what is wrong with them.
#include "host/server/Parameters.h"

#include <gmock/gmock.h>

#include "host/server/CimError.h"

namespace cmpihost::server {
namespace {

using namespace std::string_literals;
using testing::ElementsAre;
using testing::IsEmpty;

const std::vector<ParameterRow> parameterRows = {
    {"ClassName", ParameterKind::ClassName},
    {"InstanceName", ParameterKind::InstanceName},
    {"ObjectName", ParameterKind::ObjectName},
    {"LocalOnly", ParameterKind::Boolean},
    {"MaxObjectCount", ParameterKind::Number},
    {"Role", ParameterKind::Text},
    {"PropertyList", ParameterKind::PropertyList},
    {"NewValue", ParameterKind::AnyValue},
    {"NewInstance", ParameterKind::Instance},
    {"ModifiedInstance", ParameterKind::NamedInstance},
    {"NewClass", ParameterKind::Anything},
};

/// A message with one parameter for each pair of a name and what is in it; empty is NULL.
Message messageWith(const std::vector<std::pair<std::string, std::string>>& parameters) {
    Message message;
    message.method = "GetInstance";
    for (const auto& [name, xml] : parameters) {
        message.parameters.push_back({name, {}, {}});
        if (!xml.empty()) message.parameters.back().value = parseXml(xml);
    }
    return message;
}

/// Status and description; empty: the parameters are as they should be.
std::string parameterError(const std::vector<std::pair<std::string, std::string>>& parameters,
                           const std::vector<ParameterRow>& rows = parameterRows) {
    try {
        Parameters(rows, messageWith(parameters));
    } catch (const CimError& error) {
        return std::to_string(error.code()) + ": " + error.what();
    }
    return {};
}

TEST(Parameters, AreFoundByTheirNamesWithoutCase) {
    const Message message = messageWith({
        {"CLASSNAME", "<CLASSNAME NAME='a_Class'/>"},
        {"instancename", "<INSTANCENAME CLASSNAME='I'><KEYVALUE>k</KEYVALUE></INSTANCENAME>"},
        {"ObjectName", "<CLASSNAME NAME='O'/>"},
        {"localonly", "<VALUE>fAlse</VALUE>"},
        {"MaxObjectCount", "<VALUE>0x10</VALUE>"},
        {"Role", "<VALUE> any text </VALUE>"},
        {"PropertyList", "<VALUE.ARRAY><VALUE>A</VALUE><VALUE>b</VALUE></VALUE.ARRAY>"},
        {"NewValue", "<VALUE.ARRAY/>"},
        {"NewInstance", "<INSTANCE CLASSNAME='N'/>"},
        {"ModifiedInstance", "<VALUE.NAMEDINSTANCE/>"},
        {"NewClass", "<CLASS NAME='C'/>"},
    });
    const Parameters parameters(parameterRows, message);
    EXPECT_EQ(parameters.className("className"), "a_Class");
    EXPECT_EQ(parameters.path("InstanceName")->keys.at(0).text, "k");
    EXPECT_TRUE(parameters.path("InstanceName")->instance);
    EXPECT_EQ(parameters.path("ObjectName")->className, "O");
    EXPECT_FALSE(parameters.flag("LocalOnly", true));
    EXPECT_EQ(parameters.number("MaxObjectCount"), 16U);
    EXPECT_EQ(parameters.text("Role"), " any text ");
    EXPECT_THAT(parameters.names("PropertyList").value(), ElementsAre("A", "b"));
    EXPECT_EQ(parameters.element("NewValue")->name, "VALUE.ARRAY");
    EXPECT_EQ(parameters.element("NewInstance")->name, "INSTANCE");
    EXPECT_EQ(parameters.element("ModifiedInstance")->name, "VALUE.NAMEDINSTANCE");
    EXPECT_EQ(parameters.element("NewClass")->name, "CLASS");
}

TEST(Parameters, AreAbsentWhenTheyAreNotGivenAndWhenTheyAreNull) {
    std::vector<std::pair<std::string, std::string>> nulls;
    for (const ParameterRow& row : parameterRows) nulls.emplace_back(row.name, "");
    for (const Message& message : {messageWith({}), messageWith(nulls)}) {
        const Parameters parameters(parameterRows, message);
        EXPECT_EQ(parameters.className("ClassName"), std::nullopt);
        EXPECT_FALSE(parameters.path("InstanceName"));
        EXPECT_FALSE(parameters.path("ObjectName"));
        EXPECT_TRUE(parameters.flag("LocalOnly", true));
        EXPECT_FALSE(parameters.flag("LocalOnly", false));
        EXPECT_EQ(parameters.number("MaxObjectCount"), std::nullopt);
        EXPECT_EQ(parameters.text("Role"), std::nullopt);
        EXPECT_EQ(parameters.names("PropertyList"), std::nullopt);
        EXPECT_EQ(parameters.element("NewValue"), nullptr);
        EXPECT_EQ(parameters.element("NewInstance"), nullptr);
        EXPECT_EQ(parameters.element("ModifiedInstance"), nullptr);
        EXPECT_EQ(parameters.element("NewClass"), nullptr);
    }
}

TEST(Parameters, ListPropertiesInAnArrayOrAsOneValue) {
    const auto names = [](const std::string& xml) {
        const Message message = messageWith({{"PropertyList", xml}});
        return *Parameters(parameterRows, message).names("PropertyList");
    };
    EXPECT_THAT(names("<VALUE.ARRAY></VALUE.ARRAY>"), IsEmpty());
    EXPECT_THAT(names("<VALUE>A</VALUE>"), ElementsAre("A"));
    EXPECT_THAT(names("<VALUE.ARRAY><VALUE>A</VALUE><VALUE></VALUE><VALUE.NULL/></VALUE.ARRAY>"),
                ElementsAre("A", "", ""));
}

TEST(Parameters, AreRefusedByTheirNames) {
    const struct {
        const char* name;
        const char* xml;
        const char* error;
    } rows[] = {
        {"Colour", "<VALUE>a</VALUE>", "4: Colour: GetInstance has no such parameter"},
        {"Colour", "", "4: Colour: GetInstance has no such parameter"},
        {"", "", "4: : GetInstance has no such parameter"},
        {"classname", "<VALUE>a</VALUE>", "4: ClassName: this parameter takes a CLASSNAME"},
        {"ClassName", "<INSTANCENAME CLASSNAME='a'/>",
         "4: ClassName: this parameter takes a CLASSNAME"},
        {"InstanceName", "<CLASSNAME NAME='a'/>",
         "4: InstanceName: this parameter takes an INSTANCENAME"},
        {"InstanceName", "<VALUE.REFERENCE><INSTANCENAME CLASSNAME='a'/></VALUE.REFERENCE>",
         "4: InstanceName: this parameter takes an INSTANCENAME"},
        {"ObjectName", "<VALUE>a</VALUE>",
         "4: ObjectName: this parameter takes a CLASSNAME or an INSTANCENAME"},
        {"LocalOnly", "<VALUE>yes</VALUE>", "4: LocalOnly: this parameter takes TRUE or FALSE"},
        {"LocalOnly", "<VALUE></VALUE>", "4: LocalOnly: this parameter takes TRUE or FALSE"},
        {"LocalOnly", "<CLASSNAME NAME='TRUE'/>",
         "4: LocalOnly: this parameter takes TRUE or FALSE"},
        {"MaxObjectCount", "<VALUE>-1</VALUE>", "4: MaxObjectCount: this parameter takes a uint32"},
        {"MaxObjectCount", "<VALUE>4294967296</VALUE>",
         "4: MaxObjectCount: this parameter takes a uint32"},
        {"MaxObjectCount", "<VALUE></VALUE>", "4: MaxObjectCount: this parameter takes a uint32"},
        {"Role", "<VALUE.ARRAY/>", "4: Role: this parameter takes a text"},
        {"PropertyList", "<CLASSNAME NAME='A'/>",
         "4: PropertyList: this parameter takes a VALUE.ARRAY of names"},
        {"NewValue", "<INSTANCE CLASSNAME='A'/>", "4: NewValue: this parameter takes a value"},
        {"NewInstance", "<VALUE>A</VALUE>", "4: NewInstance: this parameter takes an INSTANCE"},
        {"ModifiedInstance", "<INSTANCE CLASSNAME='A'/>",
         "4: ModifiedInstance: this parameter takes a VALUE.NAMEDINSTANCE"},
    };
    for (const auto& row : rows) EXPECT_EQ(parameterError({{row.name, row.xml}}), row.error);
}

TEST(Parameters, AreGivenAtMostOnce) {
    for (const char* first : {"", "<VALUE>a</VALUE>"}) {
        EXPECT_EQ(parameterError({{"Role", first}, {"ROLE", ""}}),
                  "4: Role: this parameter is given twice");
    }
}

TEST(Parameters, ThatAreRequiredAreGivenAndNotNull) {
    const std::vector<ParameterRow> rows = {{"ClassName", ParameterKind::ClassName, true},
                                            {"Role", ParameterKind::Text}};
    EXPECT_EQ(parameterError({{"className", "<CLASSNAME NAME='a'/>"}}, rows), "");
    EXPECT_EQ(parameterError({{"Role", "<VALUE>a</VALUE>"}}, rows),
              "4: ClassName: GetInstance needs this parameter");
    EXPECT_EQ(parameterError({{"ClassName", ""}}, rows),
              "4: ClassName: GetInstance needs this parameter");
}

TEST(Parameters, AreAskedForAsWhatTheyAre) {
    const Message message = messageWith({});
    const Parameters parameters(parameterRows, message);
    EXPECT_THROW(parameters.text("Colour"), std::logic_error);
    EXPECT_THROW(parameters.text("ClassName"), std::logic_error);
    EXPECT_THROW(parameters.flag("Role", true), std::logic_error);
    EXPECT_THROW(parameters.path("ClassName"), std::logic_error);
    EXPECT_THROW(parameters.element("ObjectName"), std::logic_error);
}

}  // namespace
}  // namespace cmpihost::server
