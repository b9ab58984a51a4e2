#include "host/cli/PathCompletion.h"

#include <gmock/gmock.h>

#include "host/cli/PathParser.h"
#include "host/mof/MofParser.h"
#include "host/mof/Schema.h"

namespace {

using namespace cmpihost;
using testing::StartsWith;

class PathCompletion : public testing::Test {
  protected:
    void SetUp() override {
        schema_.add(
            mof::parse("class Thing { [Key] string Name; [Key] uint16 Number; [Key] boolean On;"
                       " string Colour; };"
                       "class Keyless { string Name; };"
                       "class Seat { [Key] string CSName; [Key] string Row; [Key] uint8 No; };"
                       "[Association] class Link { [Key] Thing REF One; [Key] Thing REF Two; };",
                       "x.mof"));
    }
    ObjectPathValue path(const std::string& text) {
        const SchemaCatalogue catalogue(schema_);
        return parsePath(text, &catalogue);
    }
    bool lacking(const std::string& text, Operation operation = Operation::GetInstance) {
        OperationRequest request;
        request.operation = operation;
        request.path = path(text);
        return lacksKeys(request, SchemaCatalogue(schema_));
    }
    /// The completed path, or the complaint.
    std::string completed(const std::string& text, const std::vector<ObjectPathValue>& names) {
        try {
            return toString(completedPath(path(text), names));
        } catch (const std::runtime_error& error) {
            return error.what();
        }
    }
    /// The name of a thing, with values of the types that a provider gives them.
    static ObjectPathValue thing(const char* name, unsigned number, bool on = true) {
        return {"root/cimv2",
                "Thing",
                {{"Name", Value::fromText(name, CMPI_chars)},
                 {"Number", Value::fromUnsigned(number, CMPI_uint16)},
                 {"On", Value::fromBoolean(on)}}};
    }

    Schema schema_;
    const std::vector<ObjectPathValue> two_ = {thing("a", 1), thing("b", 2, false)};
};

TEST_F(PathCompletion, IsForPathsOfInstancesThatLackAKey) {
    for (const char* text : {"Thing", "Thing.Name=\"a\"", "thing.NAME=\"a\",Number=1",
                             "Link.One=\"Thing.Name=\\\"a\\\"\""}) {
        EXPECT_TRUE(lacking(text)) << text;
    }
    for (const char* text : {"Thing.on=TRUE,number=1,name=\"a\"", "Keyless", "Stranger",
                             "Thing.Name=\"a\",Number=1,On=TRUE,Extra=1", "Thing.Nam=\"a\"",
                             "Thing.Name=\"a\",Colour=\"red\""}) {
        EXPECT_FALSE(lacking(text)) << text;
    }
}

TEST_F(PathCompletion, IsForOperationsOnOneInstanceThatThereIs) {
    for (const Operation operation :
         {Operation::GetInstance, Operation::Associators, Operation::AssociatorNames,
          Operation::References, Operation::ReferenceNames}) {
        EXPECT_TRUE(lacking("Thing", operation)) << operationName(operation);
    }
    for (const Operation operation :
         {Operation::EnumerateInstances, Operation::EnumerateInstanceNames,
          Operation::CreateInstance, Operation::ModifyInstance, Operation::DeleteInstance,
          Operation::ExecQuery}) {
        EXPECT_FALSE(lacking("Thing", operation)) << operationName(operation);
    }
}

TEST_F(PathCompletion, LooksAmongTheNamesOfTheClass) {
    const OperationRequest request = namesRequest(path("interop:Thing.Name=\"a\""));
    EXPECT_EQ(request.operation, Operation::EnumerateInstanceNames);
    EXPECT_EQ(request.path, (ObjectPathValue{"interop", "Thing", {}}));
}

TEST_F(PathCompletion, TakesTheOnlyNameThatHasTheGivenKeys) {
    const char* const a = "root/cimv2:Thing.Name=\"a\",Number=1,On=TRUE";
    const char* const b = "root/cimv2:Thing.Name=\"b\",Number=2,On=FALSE";
    const struct {
        const char* given;
        const char* completed;
    } rows[] = {{"Thing.Name=\"a\"", a},
                {"Thing.NUMBER=2", b},
                {"Thing.On=FALSE", b},
                {"thing.On=TRUE,Name=\"a\"", a}};
    for (const auto& row : rows) {
        EXPECT_EQ(completed(row.given, two_), row.completed) << row.given;
    }
    EXPECT_EQ(completed("Thing", {two_[0]}), a);
}

TEST_F(PathCompletion, ComparesReferencesAsPaths) {
    const auto link = [](const char* one, const char* two) {
        return ObjectPathValue{"root/cimv2",
                               "Link",
                               {{"One", Value::fromReference(thing(one, 1))},
                                {"Two", Value::fromReference(thing(two, 2))}}};
    };
    ObjectPathValue given{"root/cimv2", "Link", {{"One", Value::fromReference(thing("b", 1))}}};
    EXPECT_EQ(completedPath(given, {link("a", "c"), link("b", "d")}), link("b", "d"));
}

TEST_F(PathCompletion, KeepsAGivenTextAsItIsWritten) {
    EXPECT_EQ(completed("Thing.Name=\"B\"", two_), "root/cimv2:Thing.Name=\"B\",Number=2,On=FALSE");
}

TEST_F(PathCompletion, ComparesTextsWithCaseButForThoseOfCSNameAndName) {
    const ObjectPathValue seat = {"root/cimv2",
                                  "Seat",
                                  {{"CSName", Value::fromText("Hall", CMPI_chars)},
                                   {"Row", Value::fromText("K", CMPI_chars)},
                                   {"No", Value::fromUnsigned(7, CMPI_uint8)}}};
    EXPECT_EQ(completed("Seat.csname=\"hALL\",row=\"K\"", {seat}),
              "root/cimv2:Seat.CSName=\"hALL\",Row=\"K\",No=7");
    EXPECT_THAT(completed("Seat.Row=\"k\"", {seat}),
                StartsWith("the path lacks keys, and no instance of Seat has those"));
}

TEST_F(PathCompletion, StaysInTheNamespaceOfThePath) {
    ObjectPathValue name = two_[0];
    name.nameSpace.clear();
    EXPECT_EQ(completed("interop:Thing", {name}), "interop:Thing.Name=\"a\",Number=1,On=TRUE");
}

TEST_F(PathCompletion, ListsTheNamesWhenNoneHasTheGivenKeys) {
    for (const char* given :
         {"Thing.Name=\"c\"", "Thing.Name=\"a\",Number=2", "Thing.Number=\"1\"", "Thing.On=1"}) {
        EXPECT_EQ(completed(given, two_),
                  "the path lacks keys, and no instance of Thing has those that it gives; the "
                  "instances are:\n"
                  "  root/cimv2:Thing.Name=\"a\",Number=1,On=TRUE\n"
                  "  root/cimv2:Thing.Name=\"b\",Number=2,On=FALSE")
            << given;
    }
    EXPECT_EQ(completed("Thing", {}), "the path lacks keys, and there is no instance of Thing");
    EXPECT_THROW(completedPath(path("Thing"), {}), NoSuchInstance);
}

TEST_F(PathCompletion, ListsTheNamesThatHaveTheGivenKeysWhenTheyAreSeveral) {
    EXPECT_EQ(completed("Thing.On=TRUE", {thing("a", 1), thing("b", 2, false), thing("c\x1b", 3)}),
              "the path lacks keys, and 2 instances of Thing have those that it gives:\n"
              "  root/cimv2:Thing.Name=\"a\",Number=1,On=TRUE\n"
              "  root/cimv2:Thing.Name=\"c\\x1b\",Number=3,On=TRUE");
}

TEST_F(PathCompletion, ListsTenNamesAtMost) {
    std::vector<ObjectPathValue> names(10, thing("a", 1));
    EXPECT_EQ(completed("Thing", names).find("more"), std::string::npos);
    names.resize(12, thing("b", 2));
    const std::string complaint = completed("Thing", names);
    EXPECT_EQ(complaint.substr(0, 77),
              "the path lacks keys, and 12 instances of Thing have those that it gives:\n  ro");
    EXPECT_EQ(complaint.substr(complaint.size() - 55),
              "root/cimv2:Thing.Name=\"a\",Number=1,On=TRUE\n  and 2 more");
}

}  // namespace
