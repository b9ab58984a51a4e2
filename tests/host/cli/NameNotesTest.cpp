#include "host/cli/NameNotes.h"

#include <gtest/gtest.h>

#include "host/mof/MofParser.h"

namespace {

using namespace cmpihost;

class NameNotes : public testing::Test {
  protected:
    void SetUp() override {
        schema_.add(
            mof::parse("class Thing : CIM_Thing { [Key] string Name; boolean On; uint32 Stop(); };"
                       "class Part : Thing { uint16 Weight; };"
                       "[Association] class Link { [Key] Thing REF One; };",
                       "x.mof"));
    }
    /// The notes, without what every line begins with.
    std::string notes(const OperationRequest& request, const OperationResult& result = {}) {
        const std::string start = "cmpihost: note: ";
        std::string text = notesOnNames(request, result, schema_);
        for (std::size_t at = text.find(start); at != std::string::npos; at = text.find(start))
            text.erase(at, start.size());
        return text;
    }
    std::string notes(Operation operation, const std::vector<std::string>& list,
                      const std::vector<std::string>& classesOfResults,
                      const std::string& asked = "Thing") {
        OperationRequest request;
        request.operation = operation;
        request.path.className = asked;
        request.properties = list;
        OperationResult result;
        for (const std::string& name : classesOfResults)
            result.instances.push_back({{"ns", name, {}}, {}});
        return notes(request, result);
    }
    static OperationRequest about(const std::string& className,
                                  Operation operation = Operation::AssociatorNames) {
        OperationRequest request;
        request.operation = operation;
        request.path.className = className;
        return request;
    }
    static OperationResult failure(CMPIrc rc) {
        OperationResult result;
        result.rc = rc;
        return result;
    }

    Schema schema_;
};

TEST_F(NameNotes, TellEachListedNameThatNoClassOfTheAnswerDeclares) {
    EXPECT_EQ(notes(Operation::EnumerateInstances, {"name", "Of\n", "Wieght"}, {"Part"}, "Part"),
              "the class Part declares no property 'Of\\n'\n"
              "the class Part declares no property 'Wieght'; did you mean Weight?\n");
    EXPECT_EQ(notes(Operation::EnumerateInstances, {"Weight"}, {}),
              "the class Thing declares no property 'Weight'\n");
    EXPECT_EQ(notes(Operation::EnumerateInstances, {"Weight"}, {"thing", "Part"}), "");
    EXPECT_EQ(notes(Operation::Associators, {"On", "Far"}, {"Part"}, "Other"),
              "the class Part declares no property 'Far'\n");
    EXPECT_EQ(notes(Operation::EnumerateInstances, {"Wieght"}, {"Part"}, "CIM_Thing"),
              "the class Part declares no property 'Wieght'; did you mean Weight?\n");
    EXPECT_EQ(notes(Operation::References, {"Two"}, {"Link"}),
              "the class Link declares no property 'Two'\n");
}

TEST_F(NameNotes, AreSilentAboutPropertiesWhereTheClassIsNotKnown) {
    EXPECT_EQ(notes(Operation::EnumerateInstances, {"Off"}, {"Stranger"}, "Stranger"), "");
    EXPECT_EQ(notes(Operation::Associators, {"Off"}, {}), "");
    EXPECT_EQ(notes(Operation::Associators, {"Off"}, {"Thing", "Stranger"}), "");
    EXPECT_EQ(notes(Operation::ModifyInstance, {"Off"}, {}), "");
}

TEST_F(NameNotes, TellAnUnknownClassOfAFailureOrAnEmptyAnswerAndWhatIsMeant) {
    const Operation names = Operation::EnumerateInstanceNames;
    EXPECT_EQ(notes(about("Stranger", names)), "the schema has no class 'Stranger'\n");
    for (const char* name : {"Prat", "pat", "KORVA_Part"}) {
        EXPECT_EQ(notes(about(name, names), failure(CMPI_RC_ERR_INVALID_CLASS)),
                  std::string("the schema has no class '") + name + "'; did you mean Part?\n");
    }
    // A class of the CIM schema is an ancestor that no file needs to declare.
    EXPECT_EQ(notes(about("CIM_Thing", names)), "");
    EXPECT_EQ(notes(about("cim_Elsewhere", names)), "");
    EXPECT_EQ(notes(about("CIM_Thnig", names)),
              "the schema has no class 'CIM_Thnig'; did you mean CIM_Thing?\n");
    OperationResult found;
    found.paths.push_back({"ns", "Part", {}});
    EXPECT_EQ(notes(about("Prat", names), found), "");
    EXPECT_EQ(notes(about("", Operation::ExecQuery)), "");
}

TEST_F(NameNotes, TellWhichNamesOfAnAssociationRequestTheSchemaDoesNotHave) {
    OperationRequest request = about("Thing");
    request.path.keys = {{"name", Value::fromText("x", CMPI_chars)}};
    request.assocClass = "lINK";
    request.resultClass = "cim_Thing";
    request.role = "one";
    EXPECT_EQ(notes(request), "");
    request.path.keys.push_back({"Nmae", Value::fromBoolean(true)});
    request.assocClass = "Lnik\n";
    request.resultClass = "Prat";
    request.role = "Name";
    request.resultRole = "Onne";
    EXPECT_EQ(notes(request),
              "the schema has no class 'Lnik\\n'; did you mean Link?\n"
              "the schema has no class 'Prat'; did you mean Part?\n"
              "no association of the schema has a role 'Name'\n"
              "no association of the schema has a role 'Onne'; did you mean One?\n"
              "the class Thing declares no key 'Nmae'; did you mean Name?\n");
}

TEST_F(NameNotes, TellAMethodThatIsNearlyOneOfTheClassAndAQueryLanguageThatFewKnow) {
    OperationRequest request = about("Part", Operation::InvokeMethod);
    const OperationResult refused = failure(CMPI_RC_ERR_METHOD_NOT_FOUND);
    for (const char* method : {"STOP", "Launch"}) {
        request.method = method;
        EXPECT_EQ(notes(request, refused), "") << method;
    }
    request.method = "Sotp";
    EXPECT_EQ(notes(request, refused),
              "the class Part declares no method 'Sotp'; did you mean Stop?\n");
    OperationRequest query = about("", Operation::ExecQuery);
    query.queryLanguage = "WLQ";
    EXPECT_EQ(notes(query, failure(CMPI_RC_ERR_FAILED)),
              "the usual query languages are WQL, CQL and DMTF:CQL, not 'WLQ'\n");
    query.queryLanguage = "dmtf:cql";
    EXPECT_EQ(notes(query, failure(CMPI_RC_ERR_FAILED)), "");
}

TEST_F(NameNotes, NameTheAssociationsWhereARequestThatNamesNoneIsRefused) {
    const OperationResult refused = failure(CMPI_RC_ERR_INVALID_CLASS);
    OperationRequest request = about("Thing");
    EXPECT_EQ(notes(request, refused), "name the association with --assoc-class, one of Link\n");
    EXPECT_EQ(notes(request, failure(CMPI_RC_ERR_FAILED)), "");
    EXPECT_EQ(notes(about("Thing", Operation::EnumerateInstances), refused), "");
    request.assocClass = "Link";
    EXPECT_EQ(notes(request, refused), "");
}

}  // namespace
