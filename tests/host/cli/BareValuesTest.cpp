#include "host/cli/BareValues.h"

#include <gtest/gtest.h>

#include <sstream>

#include "host/cli/PathParser.h"
#include "host/mof/MofParser.h"

namespace {

using namespace cmpihost;

std::string bare(const Value& value) {
    std::ostringstream stream;
    const InstanceValue instance{{"n", "A", {}}, {{"P", value}}};
    makeValuePrinter(stream, "p")->print(std::vector{instance, instance});
    return stream.str();
}

TEST(BareValues, AreLinesWithNothingBesideThem) {
    EXPECT_EQ(bare(Value("a \"b\"\n\x1b[31m")), "a \"b\"\\n\\x1b[31m\na \"b\"\\n\\x1b[31m\n");
    EXPECT_EQ(bare(Value("")), "\n\n");
    EXPECT_EQ(bare(Value::fromUnsigned(UINT64_MAX)),
              "18446744073709551615\n18446744073709551615\n");
    EXPECT_EQ(bare(Value::fromBoolean(false)), "FALSE\nFALSE\n");
    EXPECT_EQ(bare(Value::fromUnsigned(0xE9, CMPI_char16)), "\u00e9\n\u00e9\n");
    EXPECT_EQ(bare(Value::fromText("00000003040506.000000:000", CMPI_dateTime)),
              "00000003040506.000000:000\n00000003040506.000000:000\n");
    EXPECT_EQ(bare(Value::fromReference({"n", "B", {{"K", Value("x")}}})),
              "n:B.K=\"x\"\nn:B.K=\"x\"\n");
}

TEST(BareValues, AreALineForEachElementOfAnArrayAndNoneForWhatIsAbsent) {
    EXPECT_EQ(bare(Value::fromArray(CMPI_uint8,
                                    {Value::fromUnsigned(1, CMPI_uint8), Value::null(CMPI_uint8),
                                     Value::fromUnsigned(2, CMPI_uint8)})),
              "1\n2\n1\n2\n");
    EXPECT_EQ(bare(Value::fromArray(CMPI_uint8, std::vector<Value>())), "");
    EXPECT_EQ(bare(Value::null(CMPI_string)), "");
}

TEST(BareValues, AreTheKeysOfPaths) {
    std::ostringstream stream;
    makeValuePrinter(stream, "K")
        ->print(std::vector<ObjectPathValue>{{"n", "B", {{"K", Value("x")}}}, {"n", "B", {}}});
    EXPECT_EQ(stream.str(), "x\n");
}

TEST(BareValues, AreMissedInANote) {
    OperationResult result;
    result.instances = {{{"n", "A", {}}, {{"P", Value("x")}}},
                        {{"n", "A", {}}, {{"P", Value::null(CMPI_string)}}}};
    EXPECT_EQ(noteOnValues("p", result), "1 of 2 results have no value of p");
    result.instances.pop_back();
    EXPECT_EQ(noteOnValues("p", result), "");
    EXPECT_EQ(noteOnValues("Q\n", result), "1 of 1 result has no value of Q\\n");
    result.instances.clear();
    result.paths = {{"n", "B", {}}};
    EXPECT_EQ(noteOnValues("K", result), "1 of 1 result has no value of K");
    EXPECT_EQ(noteOnValues("K", {}), "");
}

/// The complaint about a name; empty when it is right.
std::string complaint(const std::string& property, const OperationRequest& request) {
    static const Schema schema = [] {
        Schema loaded;
        loaded.add(
            mof::parse("class A { [Key] string Name; uint8 Size; };"
                       "class B : A { uint8 Extra; };"
                       "class C { [Key] string Other; };"
                       "[Association] class L { [Key] A REF Left; [Key] C REF Right; };",
                       "x.mof"));
        return loaded;
    }();
    try {
        checkValueName(property, request, schema);
    } catch (const UsageError& error) {
        return error.what();
    }
    return {};
}

OperationRequest asking(Operation operation, const std::string& className,
                        const std::optional<std::string>& resultClass = {}) {
    OperationRequest request;
    request.operation = operation;
    request.path.className = className;
    request.resultClass = resultClass;
    return request;
}

TEST(BareValues, HaveNamesThatAResultCanHave) {
    for (const char* name : {"name", "SIZE", "Extra"})
        EXPECT_EQ(complaint(name, asking(Operation::EnumerateInstances, "a")), "") << name;
    EXPECT_EQ(complaint("Sise", asking(Operation::GetInstance, "a")),
              "--value: the class A declares no property 'Sise'; did you mean Size?");
    EXPECT_EQ(complaint("Size", asking(Operation::EnumerateInstanceNames, "A")),
              "--value: the class A declares no key 'Size'");
    EXPECT_EQ(complaint("Anything", asking(Operation::GetInstance, "Unknown")), "");
}

TEST(BareValues, OfAssociationRequestsHaveNamesOfTheFarEndOrOfTheAssociation) {
    EXPECT_EQ(complaint("Other", asking(Operation::Associators, "A")), "");
    EXPECT_EQ(complaint("Size", asking(Operation::Associators, "A", "C")),
              "--value: the class C declares no property 'Size'");
    EXPECT_EQ(complaint("Size", asking(Operation::Associators, "A", "Unknown")), "");
    EXPECT_EQ(complaint("Left", asking(Operation::ReferenceNames, "A")), "");
    EXPECT_EQ(complaint("Size", asking(Operation::References, "A")),
              "--value: no association of the schema declares a property 'Size'");
    EXPECT_EQ(complaint("Extra", asking(Operation::AssociatorNames, "A")),
              "--value: no class of the schema declares a key 'Extra'");
}

}  // namespace
