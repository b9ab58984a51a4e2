#include "host/server/Dispatcher.h"

#include <gmock/gmock.h>

#include <iterator>
#include <thread>

#include "base/Ascii.h"
#include "host/server/Operations.h"
#include "host/server/ServerFixture.h"

namespace cmpihost::server {
namespace {

using namespace fixture;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

/// An operation and what it takes: "!" is a parameter that has to be there.
struct OperationNames {
    const char* name;
    const char* parameters;
};

constexpr const char* pullParameters = "EnumerationContext! MaxObjectCount!";
constexpr OperationNames operationNames[] = {
    {"GetInstance", "InstanceName! LocalOnly IncludeQualifiers IncludeClassOrigin PropertyList"},
    {"EnumerateInstances",
     "ClassName! LocalOnly DeepInheritance IncludeQualifiers IncludeClassOrigin PropertyList"},
    {"EnumerateInstanceNames", "ClassName!"},
    {"GetProperty", "InstanceName! PropertyName!"},
    {"SetProperty", "InstanceName! PropertyName! NewValue"},
    {"CreateInstance", "NewInstance!"},
    {"ModifyInstance", "ModifiedInstance! IncludeQualifiers PropertyList"},
    {"DeleteInstance", "InstanceName!"},
    {"ExecQuery", "QueryLanguage! Query!"},
    {"Associators",
     "ObjectName! AssocClass ResultClass Role ResultRole IncludeQualifiers IncludeClassOrigin "
     "PropertyList"},
    {"AssociatorNames", "ObjectName! AssocClass ResultClass Role ResultRole"},
    {"References",
     "ObjectName! ResultClass Role IncludeQualifiers IncludeClassOrigin PropertyList"},
    {"ReferenceNames", "ObjectName! ResultClass Role"},
    {"GetClass", "ClassName! LocalOnly IncludeQualifiers IncludeClassOrigin PropertyList"},
    {"EnumerateClasses",
     "ClassName DeepInheritance LocalOnly IncludeQualifiers IncludeClassOrigin"},
    {"EnumerateClassNames", "ClassName DeepInheritance"},
    {"GetQualifier", "QualifierName!"},
    {"EnumerateQualifiers", ""},
    // What is refused whatever comes.
    {"CreateClass", "NewClass"},
    {"ModifyClass", "ModifiedClass"},
    {"DeleteClass", "ClassName"},
    {"SetQualifier", "QualifierDeclaration"},
    {"DeleteQualifier", "QualifierName"},
    {"OpenQueryInstances",
     "ReturnQueryResultClass FilterQueryLanguage FilterQuery OperationTimeout ContinueOnError "
     "MaxObjectCount"},
    {"EnumerationCount", "EnumerationContext!"},
    {"OpenEnumerateInstances",
     "ClassName! DeepInheritance IncludeClassOrigin PropertyList FilterQueryLanguage FilterQuery "
     "OperationTimeout ContinueOnError MaxObjectCount"},
    {"OpenEnumerateInstancePaths",
     "ClassName! FilterQueryLanguage FilterQuery OperationTimeout ContinueOnError MaxObjectCount"},
    {"OpenAssociatorInstances",
     "InstanceName! AssocClass ResultClass Role ResultRole IncludeClassOrigin PropertyList "
     "FilterQueryLanguage FilterQuery OperationTimeout ContinueOnError MaxObjectCount"},
    {"OpenAssociatorInstancePaths",
     "InstanceName! AssocClass ResultClass Role ResultRole FilterQueryLanguage FilterQuery "
     "OperationTimeout ContinueOnError MaxObjectCount"},
    {"OpenReferenceInstances",
     "InstanceName! ResultClass Role IncludeClassOrigin PropertyList FilterQueryLanguage "
     "FilterQuery OperationTimeout ContinueOnError MaxObjectCount"},
    {"OpenReferenceInstancePaths",
     "InstanceName! ResultClass Role FilterQueryLanguage FilterQuery OperationTimeout "
     "ContinueOnError MaxObjectCount"},
    {"PullInstancesWithPath", pullParameters},
    {"PullInstancePaths", pullParameters},
    {"PullInstances", pullParameters},
    {"CloseEnumeration", "EnumerationContext!"},
};

TEST(Operations, HaveTheirNamesWithoutCaseAndTheirParameters) {
    for (const OperationNames& each : operationNames) {
        for (const std::string& name : {std::string(each.name), base::toLower(each.name)}) {
            const OperationRow* const row = findOperation(name);
            ASSERT_NE(row, nullptr) << name;
            EXPECT_EQ(row->name, std::string(each.name));
            std::string parameters;
            for (const ParameterRow& parameter : row->parameters) {
                parameters += parameters.empty() ? "" : " ";
                parameters += parameter.name;
                parameters += parameter.required ? "!" : "";
            }
            EXPECT_EQ(parameters, each.parameters) << name;
        }
    }
    std::size_t rows = 0;
    for (const auto* const group :
         {&instanceOperations(), &associationOperations(), &classOperations(), &pullOperations()})
        rows += group->size();
    EXPECT_EQ(rows, std::size(operationNames));
    EXPECT_EQ(findOperation(""), nullptr);
    EXPECT_EQ(findOperation("GetInstances"), nullptr);
}

TEST(Operations, KnowNoneButTheNamespacesThatThereAre) {
    for (const OperationNames& each : operationNames)
        EXPECT_EQ(error(respond(operation(each.name, {}, "root/nope"))),
                  "3: root/nope: no such namespace")
            << each.name;
}

/// What an operation is refused for, of several things that are wrong with it.
TEST(Dispatcher, TestsNamespaceOperationParametersAndClassInThisOrder) {
    const std::string badParameter = value("Nonsense", "1");
    const std::string badClass = className("ClassName", "KORVA_Nothing");
    const std::string badKey =
        parameter("InstanceName", instanceName("KORVA_Nothing", {{"x", "1"}}));
    const struct {
        std::string request;
        const char* error;
    } rows[] = {
        {operation("Nonsense", badParameter, "root/nope"), "3: root/nope: no such namespace"},
        {operation("EnumerateInstances", badParameter + badClass, "root/nope"),
         "3: root/nope: no such namespace"},
        {methodCall("Nonsense", "<CLASSNAME NAME=\"KORVA_Nothing\"/>", "", "root/nope"),
         "3: root/nope: no such namespace"},
        {operation("Nonsense", badParameter), "7: Nonsense: there is no such operation"},
        {operation("EnumerateInstances", badParameter + badClass),
         "4: Nonsense: EnumerateInstances has no such parameter"},
        {operation("EnumerateInstances", badClass),
         "5: KORVA_Nothing: no such class in root/cimv2"},
        {operation("GetInstance", badKey), "5: KORVA_Nothing: no such class in root/cimv2"},
    };
    for (const auto& row : rows) EXPECT_EQ(error(respond(row.request)), row.error);
}

TEST(Dispatcher, AnswersInTheWordsOfTheRequest) {
    std::string request = operation("eNumerateInstanceNAMES",
                                    className("classname", "korva_operatingsystem"), "ROOT/CIMV2");
    request.replace(request.find("ID=\"7\""), 6, "ID=\"a&lt;b\"");
    EXPECT_THAT(respond(request),
                StartsWith("<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<CIM CIMVERSION=\"2.0\" "
                           "DTDVERSION=\"2.0\"><MESSAGE ID=\"a&lt;b\" PROTOCOLVERSION=\"1.0\">"
                           "<SIMPLERSP><IMETHODRESPONSE NAME=\"eNumerateInstanceNAMES\">"
                           "<IRETURNVALUE><INSTANCENAME CLASSNAME=\"KORVA_OperatingSystem\">"));
}

TEST(Dispatcher, CountsWhatItAnswers) {
    ObjectManager& manager = shippedManager();
    const auto operations = manager.statistics().operations();
    const auto failures = manager.statistics().failures();
    respond(operation("EnumerateInstanceNames", className("ClassName", "KORVA_RunningOS")));
    respond(operation("Nonsense"));
    EXPECT_EQ(manager.statistics().operations() - operations, 2U);
    EXPECT_EQ(manager.statistics().failures() - failures, 1U);
    EXPECT_GT(manager.statistics().busyTime().count(), 0);
}

TEST(Dispatcher, TellsTheStatusBesideTheDocument) {
    const Message unknown = readMessage(operation("Nonsense"));
    EXPECT_EQ(answer(shippedManager(), unknown, {}).code, 7U);
    const Message good =
        readMessage(operation("EnumerateInstances", className("ClassName", "CIM_Nothing")));
    EXPECT_EQ(answer(shippedManager(), good, {}).code, 5U);
}

TEST(Dispatcher, AnswersFourThreadsAtOnce) {
    ObjectManager& manager = shippedManager();
    const std::string requests[] = {
        operation("EnumerateInstances", className("ClassName", "CIM_ManagedElement")),
        operation("GetInstance", parameter("InstanceName", operatingSystem())),
        operation("AssociatorNames", parameter("ObjectName", computerSystem())),
        operation("EnumerateClassNames"),
    };
    std::string alone[4];
    for (int each = 0; each < 4; ++each) alone[each] = respond(manager, requests[each]);
    std::atomic<int> equal = 0;
    std::vector<std::thread> threads;
    for (int start = 0; start < 4; ++start) {
        threads.emplace_back([&, start] {
            for (int round = 0; round < 40; ++round) {
                const int each = (start + round) % 4;
                const Message message = readMessage(requests[each]);
                if (answer(manager, message, {}).document == alone[each]) ++equal;
            }
        });
    }
    for (std::thread& thread : threads) thread.join();
    EXPECT_EQ(equal, 160);
    EXPECT_THAT(manager.takeComplaints(), IsEmpty());
}

}  // namespace
}  // namespace cmpihost::server
