#include <fstream>
#include <sstream>

#include "facade/FacadeFixture.h"

// The whole sequence of records that a request of the facade leaves: the provider's for each
// question, and one line for a refusal. The expected ones stand in records/, a file a sequence.

namespace {

using namespace facade;

class FacadeRecords : public FacadeFixture {
  protected:
    void expectRecords(const OperationRequest& request, const std::string& name) {
        ask(request);
        const std::string actual = recording::takeRendered();
        std::ifstream expected(std::string(KORVA_TEST_DATA "/records/") + name + ".txt");
        std::ostringstream text;
        text << expected.rdbuf();
        EXPECT_EQ(actual, text.str());
    }
};

TEST_F(FacadeRecords, OfCapabilitiesOfAnOperatingSystem) {
    expectRecords(associationRequest(Operation::Associators, operatingSystemPath("host1", "Linux"),
                                     "CIM_ElementCapabilities"),
                  "AssociatorsOfOperatingSystemByCapabilities");
}

TEST_F(FacadeRecords, OfAnInstanceThatIsNotThere) {
    OperationRequest request;
    request.operation = Operation::GetInstance;
    request.path = operatingSystemPath("host1", "other");
    expectRecords(request, "GetInstanceOfUnknownOperatingSystem");
}

TEST_F(FacadeRecords, OfARefusedOperation) {
    OperationRequest request;
    request.operation = Operation::DeleteInstance;
    request.path = operatingSystemPath("host1", "Linux");
    expectRecords(request, "DeleteInstance");
}

TEST_F(FacadeRecords, OfASourceOfAnotherClassAreNone) {
    ask(associationRequest(Operation::AssociatorNames, path("TEST_Thing", {{"Name", "x"}})));
    EXPECT_EQ(recording::takeRendered(), "");
}

}  // namespace
