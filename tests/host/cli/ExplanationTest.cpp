#include "host/cli/Explanation.h"

#include <gtest/gtest.h>

#include "host/mof/MofParser.h"

namespace {

using namespace cmpihost;

/// A provider of one instance, Thing.Name="there", which is associated with two others by the
/// association Link: one in the role Left, one in the role Right.
OperationResult answer(const OperationRequest& request) {
    OperationResult result;
    const bool there = toString(request.path) == "ns:Thing.Name=\"there\"";
    if (request.operation == Operation::GetInstance) {
        result.rc = there ? CMPI_RC_OK : CMPI_RC_ERR_NOT_FOUND;
        if (there) result.instances.push_back({request.path, {}});
        return result;
    }
    for (const char* role : {"Left", "Right"}) {
        const bool passes = there && request.assocClass.value_or("Link") == "Link" &&
                            request.role.value_or(role) == role &&
                            request.resultRole.value_or(role) == role;
        if (passes) result.paths.push_back({"ns", "Other", {}});
    }
    return result;
}

OperationRequest association(const char* name) {
    OperationRequest request;
    request.operation = Operation::AssociatorNames;
    request.path = {"ns", "Thing", {{"Name", Value::fromText(name, CMPI_chars)}}};
    return request;
}

std::string reason(const OperationRequest& request) {
    Schema schema;
    schema.add(mof::parse("[Abstract] class Base { };", "x.mof"));
    EXPECT_TRUE(isEmptyAnswer(request, answer(request)));
    return reasonForNothing(request, schema, answer);
}

TEST(Explanation, NamesTheFilterThatNothingPasses) {
    OperationRequest request = association("there");
    request.assocClass = "Chain";
    request.role = "Left";
    EXPECT_EQ(
        reason(request),
        "cmpihost: note: nothing passes the filter --assoc-class Chain: without filters there "
        "are 2 results\n");
    request.assocClass = "Link";
    request.resultRole = "Right";
    EXPECT_EQ(reason(request),
              "cmpihost: note: nothing passes the filters --assoc-class Link and --role Left and "
              "--result-role Right together: without filters there are 2 results\n");
}

TEST(Explanation, TellsASourceThatIsNotThereFromOneThatNothingIsAssociatedWith) {
    OperationRequest request = association("away");
    EXPECT_EQ(reason(request), "cmpihost: note: there is no instance ns:Thing.Name=\"away\"\n");
    request.role = "Left";
    EXPECT_EQ(reason(request), "cmpihost: note: there is no instance ns:Thing.Name=\"away\"\n");
    const auto alone = [](const OperationRequest& asked) {
        return asked.operation == Operation::GetInstance ? answer(asked) : OperationResult();
    };
    EXPECT_EQ(reasonForNothing(association("there"), Schema(), alone),
              "cmpihost: note: nothing is associated with ns:Thing.Name=\"there\"\n");
    // One that answers nothing without its filters.
    const auto strict = [](const OperationRequest& asked) {
        OperationResult result;
        result.rc = asked.operation == Operation::GetInstance ? CMPI_RC_OK : CMPI_RC_ERR_FAILED;
        if (result.rc == CMPI_RC_OK) result.instances.push_back({asked.path, {}});
        return result;
    };
    request = association("there");
    request.assocClass = "Link";
    EXPECT_EQ(reasonForNothing(request, Schema(), strict),
              "cmpihost: note: nothing is associated with ns:Thing.Name=\"there\" that passes "
              "--assoc-class Link\n");
}

TEST(Explanation, SaysWhatTheOtherOperationsLack) {
    const struct {
        Operation operation;
        const char* className;
        const char* reason;
    } rows[] = {
        {Operation::EnumerateInstances, "base",
         "the class Base is abstract: it has no instances "
         "itself"},
        {Operation::EnumerateInstanceNames, "A\n", "there is no instance of A\\n in ns"},
        {Operation::GetInstance, "A",
         "no instance was returned; an object manager answers CIM_ERR_NOT_FOUND (6)"},
        {Operation::CreateInstance, "A", "the provider returned no path of the new instance"},
        {Operation::ExecQuery, "A", "the query selects nothing"},
    };
    for (const auto& row : rows) {
        OperationRequest request;
        request.operation = row.operation;
        request.path = {"ns", row.className, {}};
        Schema schema;
        schema.add(mof::parse("[Abstract] class Base { };", "x.mof"));
        EXPECT_EQ(reasonForNothing(request, schema, answer),
                  std::string("cmpihost: note: ") + row.reason + "\n");
    }
}

TEST(Explanation, IsNotNeededWhereNothingIsToBeReturned) {
    OperationRequest request;
    for (const Operation operation :
         {Operation::ModifyInstance, Operation::DeleteInstance, Operation::InvokeMethod}) {
        request.operation = operation;
        EXPECT_FALSE(isEmptyAnswer(request, {}));
    }
    request.operation = Operation::EnumerateInstances;
    EXPECT_TRUE(isEmptyAnswer(request, {}));
    OperationResult result;
    result.rc = CMPI_RC_ERR_FAILED;
    EXPECT_FALSE(isEmptyAnswer(request, result));
    result = {};
    result.instances.emplace_back();
    EXPECT_FALSE(isEmptyAnswer(request, result));
}

}  // namespace
