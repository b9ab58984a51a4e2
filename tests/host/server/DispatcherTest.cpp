#include "host/server/Dispatcher.h"

#include <gmock/gmock.h>

#include <thread>

#include "host/server/Operations.h"
#include "host/server/ServerFixture.h"

namespace cmpihost::server {
namespace {

using namespace fixture;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

TEST(Operations, HaveTheirNamesWithoutCase) {
    for (const char* name :
         {"GetInstance",           "enumerateinstances", "ENUMERATEINSTANCENAMES",
          "GetProperty",           "SetProperty",        "CreateInstance",
          "ModifyInstance",        "DeleteInstance",     "ExecQuery",
          "Associators",           "AssociatorNames",    "References",
          "ReferenceNames",        "GetClass",           "EnumerateClasses",
          "EnumerateClassNames",   "CreateClass",        "ModifyClass",
          "DeleteClass",           "GetQualifier",       "EnumerateQualifiers",
          "SetQualifier",          "DeleteQualifier",    "OpenEnumerateInstances",
          "PullInstancesWithPath", "CloseEnumeration"}) {
        const OperationRow* const row = findOperation(name);
        ASSERT_NE(row, nullptr) << name;
        EXPECT_STRCASEEQ(row->name, name);
    }
    EXPECT_EQ(findOperation(""), nullptr);
    EXPECT_EQ(findOperation("GetInstances"), nullptr);
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
