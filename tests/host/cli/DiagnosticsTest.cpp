#include "host/cli/Diagnostics.h"

#include <gtest/gtest.h>

#include "host/mof/MofParser.h"

namespace {

using namespace cmpihost;

class Diagnostics : public testing::Test {
  protected:
    void SetUp() override {
        schema_.add(
            mof::parse("class Thing { [Key] string Name; boolean On; };"
                       "class Part : Thing { uint16 Weight; };"
                       "[Association] class Link { [Key] Thing REF One; };",
                       "x.mof"));
    }
    std::string notes(Operation operation, const std::vector<std::string>& list,
                      const std::vector<std::string>& classesOfResults,
                      const std::string& asked = "Thing") {
        OperationRequest request;
        request.operation = operation;
        request.path.className = asked;
        request.properties = list;
        OperationResult result;
        for (const std::string& name : classesOfResults) {
            result.instances.push_back({{"ns", name, {}}, {}});
        }
        return notesOn(request, result, schema_);
    }
    static OperationRequest association(Operation operation) {
        OperationRequest request;
        request.operation = operation;
        request.path.className = "Thing";
        return request;
    }
    std::string hint(Operation operation, CMPIrc rc) {
        OperationRequest request = association(operation);
        OperationResult failure;
        failure.rc = rc;
        return hintFor(request, failure, schema_);
    }

    Schema schema_;
};

TEST_F(Diagnostics, NoteEachListedNameThatNoClassOfTheAnswerDeclares) {
    EXPECT_EQ(notes(Operation::EnumerateInstances, {"name", "Of\n", "Weight"}, {}),
              "note: the class Thing declares no property 'Of\\n'\n"
              "note: the class Thing declares no property 'Weight'\n");
    EXPECT_EQ(notes(Operation::EnumerateInstances, {"Weight"}, {"thing", "Part"}), "");
    EXPECT_EQ(notes(Operation::Associators, {"On", "Off"}, {"Part"}, "Other"),
              "note: the class Part declares no property 'Off'\n");
    EXPECT_EQ(notes(Operation::References, {"Two"}, {"Link"}),
              "note: the class Link declares no property 'Two'\n");
}

TEST_F(Diagnostics, AreSilentAboutNamesWhereTheClassIsNotKnown) {
    EXPECT_EQ(notes(Operation::EnumerateInstances, {"Off"}, {}, "Stranger"), "");
    EXPECT_EQ(notes(Operation::Associators, {"Off"}, {}), "");
    EXPECT_EQ(notes(Operation::Associators, {"Off"}, {"Thing", "Stranger"}), "");
    EXPECT_EQ(notes(Operation::ModifyInstance, {"Off"}, {}), "");
}

TEST_F(Diagnostics, TellWhatAnObjectManagerMakesOfOtherThanOneInstance) {
    EXPECT_EQ(notes(Operation::GetInstance, {}, {"Thing"}), "");
    EXPECT_EQ(notes(Operation::GetInstance, {"Off"}, {}),
              "note: no instance was returned; an object manager answers CIM_ERR_NOT_FOUND (6)\n"
              "note: the class Thing declares no property 'Off'\n");
    EXPECT_EQ(notes(Operation::GetInstance, {}, {"Thing", "Thing"}),
              "note: 2 instances were returned; an object manager takes the first\n");
}

TEST_F(Diagnostics, HintAtTheAssociationThatARequestDoesNotName) {
    EXPECT_EQ(hint(Operation::AssociatorNames, CMPI_RC_ERR_INVALID_CLASS),
              "hint: name the association with --assoc-class, one of Link\n");
    EXPECT_EQ(hint(Operation::Associators, CMPI_RC_ERR_FAILED), "");
    EXPECT_EQ(hint(Operation::EnumerateInstances, CMPI_RC_ERR_INVALID_CLASS), "");
}

TEST_F(Diagnostics, TellWhichNamesOfAnAssociationRequestWithoutAnAnswerTheSchemaDoesNotHave) {
    OperationRequest request = association(Operation::AssociatorNames);
    const auto answered = [&](const OperationResult& result) {
        return notesOn(request, result, schema_);
    };
    request.path.keys = {{"name", Value::fromText("x", CMPI_chars)}};
    request.assocClass = "lINK";
    request.resultClass = "cim_Thing";
    request.role = "one";
    EXPECT_EQ(answered({}), "");
    request.path.keys.push_back({"On", Value::fromBoolean(true)});
    request.assocClass = "Lnik\n";
    request.resultClass = "Prat";
    request.role = "Name";
    request.resultRole = "Two";
    EXPECT_EQ(answered({}),
              "note: the schema has no class 'Lnik\\n'\n"
              "note: the schema has no class 'Prat'\n"
              "note: no association of the schema has a role 'Name'\n"
              "note: no association of the schema has a role 'Two'\n"
              "note: the class Thing declares no key 'On'\n");
    OperationResult found;
    found.paths.push_back({"ns", "Part", {}});
    EXPECT_EQ(answered(found), "");
    for (const Operation operation :
         {Operation::Associators, Operation::References, Operation::ReferenceNames}) {
        request = association(operation);
        request.path.className = "Thnig";
        EXPECT_EQ(answered({}), "note: the schema has no class 'Thnig'\n");
    }
}

TEST_F(Diagnostics, HintAtTheAssociationThatARequestMisspells) {
    OperationRequest request = association(Operation::AssociatorNames);
    request.assocClass = "Lnik";
    OperationResult failure;
    failure.rc = CMPI_RC_ERR_INVALID_CLASS;
    EXPECT_EQ(hintFor(request, failure, schema_), "hint: the schema has no class 'Lnik'\n");
    request.assocClass = "Link";
    EXPECT_EQ(hintFor(request, failure, schema_), "");
}

TEST(StatusText, NamesTheStatus) {
    EXPECT_EQ(statusText(CMPI_RC_ERR_FAILED), "CIM_ERR_FAILED (1)");
    EXPECT_EQ(statusText(CMPI_RC_ERR_INVALID_CLASS), "CIM_ERR_INVALID_CLASS (5)");
    EXPECT_EQ(statusText(CMPI_RC_ERR_NOT_FOUND), "CIM_ERR_NOT_FOUND (6)");
    EXPECT_EQ(statusText(CMPI_RC_ERR_NOT_SUPPORTED), "CIM_ERR_NOT_SUPPORTED (7)");
    EXPECT_EQ(statusText(CMPI_RC_ERR_METHOD_NOT_FOUND), "CIM_ERR_METHOD_NOT_FOUND (17)");
    EXPECT_EQ(statusText(CMPI_RC_DO_NOT_UNLOAD), "CMPI_RC_DO_NOT_UNLOAD (50)");
    EXPECT_EQ(statusText(static_cast<CMPIrc>(150)), "CMPI status 150");
}

TEST(StatusText, AddsTheMessageWithoutItsControlCharacters) {
    OperationResult result;
    result.rc = CMPI_RC_ERR_ACCESS_DENIED;
    EXPECT_EQ(failureText(result), "CIM_ERR_ACCESS_DENIED (2)");
    result.message = "go\x1b[31m away";
    EXPECT_EQ(failureText(result), "CIM_ERR_ACCESS_DENIED (2): go\\x1b[31m away");
}

}  // namespace
