#include "host/cli/RequestBuilder.h"
#include "host/cli/Results.h"

#include <gmock/gmock.h>

#include "host/mof/MofParser.h"
#include "host/mof/Schema.h"

namespace {

using namespace cmpihost;
using testing::ElementsAre;

const char* text =
    "class Thing { [Key] string Name; [Key] uint16 Number; boolean On; sint8 Level; uint64 Size;"
    " real32 Ratio; datetime When; char16 Letter; uint16 Codes[]; string Notes[]; Thing REF Next;"
    " sint64 Deep; real64 Wide; };";

class RequestBuilder : public testing::Test {
  protected:
    void SetUp() override { schema_.add(mof::parse(text, "x.mof")); }

    OperationRequest built(const CommandLine& line) {
        return buildRequest(line, schema_, SchemaCatalogue(schema_));
    }
    OperationRequest built(Operation operation, const char* path,
                           std::vector<std::string> assignments) {
        CommandLine line;
        line.operation = operation;
        line.path = path;
        line.assignments = std::move(assignments);
        return built(line);
    }
    Value assigned(const std::string& assignment) {
        return built(Operation::ModifyInstance, "Thing", {assignment})
            .instance.properties.at(0)
            .value;
    }
    std::string refusal(const std::string& path, const std::vector<std::string>& assignments) {
        try {
            built(Operation::CreateInstance, path.c_str(), assignments);
            return "accepted";
        } catch (const UsageError& error) {
            return error.what();
        }
    }

    Schema schema_;
};

TEST_F(RequestBuilder, GivesValuesTheTypesOfTheClass) {
    const Value two = Value::fromUnsigned(2, CMPI_uint16);
    const char* const date = "20240102030405.000000+000";
    const char* const interval = "00000012030405.000000:000";
    const std::pair<std::string, Value> rows[] = {
        {"Name=a b", "a b"},
        {"Name=", ""},
        {"Name={x}", "{x}"},
        {"On=true", Value::fromBoolean(true)},
        {"On=NULL", Value::null(CMPI_boolean)},
        {"Level=-128", Value::fromSigned(-128, CMPI_sint8)},
        {"Level=127", Value::fromSigned(127, CMPI_sint8)},
        {"Deep=-9223372036854775808", Value::fromSigned(INT64_MIN, CMPI_sint64)},
        {"Size=18446744073709551615", Value::fromUnsigned(UINT64_MAX, CMPI_uint64)},
        {"Size=-0", Value::fromUnsigned(0, CMPI_uint64)},
        {"Ratio=0.5", Value::fromReal(0.5, CMPI_real32)},
        {"Ratio=2", Value::fromReal(2, CMPI_real32)},
        {"Wide=-3", Value::fromReal(-3, CMPI_real64)},
        {"Wide=3", Value::fromReal(3, CMPI_real64)},
        {std::string("When=") + date, Value::fromText(date, CMPI_dateTime)},
        {std::string("When=") + interval, Value::fromText(interval, CMPI_dateTime)},
        {"When=null", Value::null(CMPI_dateTime)},
        {"Letter='x'", Value::fromUnsigned('x', CMPI_char16)},
        {"Next=Thing.Name=\"y\"",
         Value::fromReference({"root/cimv2", "Thing", {{"Name", Value("y")}}})},
        {"Codes={2, 2}", Value::fromArray(CMPI_uint16, {two, two})},
        {"Codes=2", Value::fromArray(CMPI_uint16, {two})},
        {"Codes={}", Value::fromArray(CMPI_uint16, std::vector<Value>())},
        {"Codes=NULL", Value::null(CMPI_uint16A)},
        {"Notes={\"a\", \"b,c\"}", Value::fromArray(CMPI_string, {Value("a"), Value("b,c")})},
        {"Notes=plain", Value::fromArray(CMPI_string, {Value("plain")})},
    };
    for (const auto& [assignment, value] : rows)
        EXPECT_EQ(assigned(assignment), value) << assignment;
}

TEST_F(RequestBuilder, TakesValuesOfAnUnknownClassAsTexts) {
    const OperationRequest request = built(Operation::CreateInstance, "Stranger", {"A=5"});
    EXPECT_EQ(request.instance.properties.at(0).value, Value("5"));
}

TEST_F(RequestBuilder, MakesAssignedKeysPartOfThePath) {
    const OperationRequest request =
        built(Operation::CreateInstance, "Thing.Number=7", {"name=x", "On=FALSE"});
    const ObjectPathValue path{
        "root/cimv2", "Thing", {{"Number", Value::fromUnsigned(7)}, {"Name", Value("x")}}};
    EXPECT_EQ(request.path, path);
    EXPECT_EQ(request.instance, (InstanceValue{path,
                                               {{"Name", Value("x")},
                                                {"On", Value::fromBoolean(false)},
                                                {"Number", Value::fromUnsigned(7)}}}));
    EXPECT_FALSE(request.properties.has_value());
}

TEST_F(RequestBuilder, ModifiesTheAssignedPropertiesOnly) {
    const OperationRequest request =
        built(Operation::ModifyInstance, "Thing.Name=\"x\"", {"on=TRUE", "Level=1"});
    EXPECT_THAT(*request.properties, ElementsAre("On", "Level"));
    EXPECT_EQ(request.instance.properties.size(), 3U);
}

TEST_F(RequestBuilder, RefusesValuesThatDoNotFit) {
    const struct {
        std::vector<std::string> assignments;
        const char* complaint;
    } rows[] = {
        {{"Level=128"}, "'128' is no value of type sint8 for the property 'Level'"},
        {{"Size=-1"}, "'-1' is no value of type uint64 for the property 'Size'"},
        {{"On=1"}, "'1' is no value of type boolean for the property 'On'"},
        {{"Level={1}"}, "'{1}' is a list, no single value, for the property 'Level'"},
        {{"On=maybe"},
         "the value of 'On': expected a value (a string, a number, a character, TRUE, FALSE or "
         "NULL), found 'maybe'"},
        {{"Size=1 2"}, "the value of 'Size': expected nothing after the value, found '2'"},
        {{"Weight=1"}, "the class 'Thing' has no property 'Weight'"},
        {{"Nmae=x"}, "the class 'Thing' has no property 'Nmae'; did you mean Name?"},
        {{"On=TRUE", "on=FALSE"}, "the property 'On' stands twice"},
        {{"On"}, "expected NAME=VALUE, found 'On'"},
        {{"=1"}, "expected NAME=VALUE, found '=1'"},
    };
    for (const auto& row : rows) EXPECT_EQ(refusal("Thing", row.assignments), row.complaint);
    EXPECT_EQ(refusal("Stranger", {"A\x1b=1", "a\x1b=2"}), "the property 'a\\x1b' stands twice");
    for (const std::string wrong :
         {"yesterday", "", "20241302030405.000000+000", "{1}", "2024-01-02"}) {
        EXPECT_EQ(refusal("Thing", {"When=" + wrong}),
                  "'" + wrong + "' is no value of type datetime for the property 'When'");
    }
}

TEST_F(RequestBuilder, FindsTheClassOfAQuery) {
    const struct {
        const char* query;
        const char* className;
    } rows[] = {{"SELECT * FROM Thing", "Thing"},
                {"select Name from\tThing;", "Thing"},
                {"SELECT * FROM Thing WHERE a = 1", "Thing"},
                {"SELECT * FROM", ""},
                {"nonsense", ""},
                {"", ""}};
    for (const auto& row : rows) {
        CommandLine line;
        line.operation = Operation::ExecQuery;
        line.query = row.query;
        line.nameSpace = "interop";
        const OperationRequest request = built(line);
        EXPECT_EQ(request.path.className, row.className) << row.query;
        EXPECT_EQ(request.path.nameSpace, "interop");
        EXPECT_EQ(request.query, row.query);
        EXPECT_EQ(request.queryLanguage, "WQL");
    }
}

TEST_F(RequestBuilder, KeepsKeysWhateverThePropertyListSays) {
    const InstanceValue instance{{"n", "Thing", {{"Extra", Value("k")}}},
                                 {{"Name", Value("a")},
                                  {"Extra", Value("k")},
                                  {"On", Value::fromBoolean(true)},
                                  {"Level", Value::fromSigned(1, CMPI_sint8)}}};
    const auto names = [&](const std::vector<std::string>& list) {
        std::vector<std::string> kept;
        for (const PropertyValue& property : withoutUnlisted(instance, list, schema_).properties) {
            kept.push_back(property.name);
        }
        return kept;
    };
    EXPECT_THAT(names({"LEVEL", "Missing"}), ElementsAre("Name", "Extra", "Level"));
    EXPECT_THAT(names({}), ElementsAre("Name", "Extra"));
}

}  // namespace
