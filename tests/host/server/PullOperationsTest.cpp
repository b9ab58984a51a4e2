#include "host/server/ResponseValidator.h"
#include "host/server/ResultSummary.h"
#include "host/server/ServerFixture.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>
#include <thread>
#include <tuple>
#include <vector>

namespace cmpihost::server::pull_tests {
namespace {

using namespace fixture;
using ::testing::HasSubstr;
using ::testing::MatchesRegex;
using ::testing::StartsWith;

using Names = std::vector<std::string>;

std::string most(unsigned count) {
    return value("MaxObjectCount", std::to_string(count));
}
std::string contextOf(const std::string& response) {
    return valueOf(response, "EnumerationContext");
}
std::string continued(const std::string& context, unsigned count) {
    return value("EnumerationContext", context) + most(count);
}

/// A manager that nobody else has altered.
ObjectManager& newForeignManager() {
    return foreignManager("# Nothing more.\n");
}

/// The answer of a manager, which is one that clients can read.
std::string answerOf(ObjectManager& manager, const std::string& name, const std::string& parameters,
                     const std::string& nameSpace = "root/test",
                     const std::optional<std::string>& user = {}) {
    const std::string answer = respond(manager, operation(name, parameters, nameSpace), user);
    EXPECT_THAT(complaintsAbout(answer, name), ::testing::IsEmpty());
    return answer;
}

/// One with five things in root/test.
ObjectManager& managerOfThings() {
    ObjectManager& manager = newForeignManager();
    for (const char* const name : {"second", "third", "fourth", "fifth"}) {
        const std::string instance =
            "<INSTANCE CLASSNAME=\"TEST_Thing\"><PROPERTY NAME=\"Name\" TYPE=\"string\"><VALUE>" +
            std::string(name) + "</VALUE></PROPERTY></INSTANCE>";
        EXPECT_EQ(
            error(respond(manager, operation("CreateInstance", parameter("NewInstance", instance),
                                             "root/test"))),
            "");
    }
    return manager;
}

const std::string things = className("ClassName", "TEST_Thing");

TEST(PullOperations, HandOutWhatTheOrdinaryOperationsAnswer) {
    const std::string os = parameter("InstanceName", operatingSystem());
    const std::string osObject = parameter("ObjectName", operatingSystem());
    const std::string filters = className("AssocClass", "CIM_Dependency") +
                                value("Role", "Antecedent") + value("ResultRole", "Dependent") +
                                className("ResultClass", "CIM_System");
    const std::string cim = className("ClassName", "CIM_ManagedElement");
    const std::string running = className("ResultClass", "CIM_RunningOS");
    struct Row {
        const char* open;
        std::string parameters;
        const char* ordinary;
        std::string ordinaryParameters;
    };
    const Row rows[] = {
        {"OpenEnumerateInstances", cim, "EnumerateInstances", cim},
        {"OpenEnumerateInstancePaths", cim, "EnumerateInstanceNames", cim},
        {"OpenAssociatorInstances", os + filters, "Associators", osObject + filters},
        {"OpenAssociatorInstances", os, "Associators", osObject},
        {"OpenAssociatorInstancePaths", os, "AssociatorNames", osObject},
        {"OpenReferenceInstances", os + running, "References", osObject + running},
        {"OpenReferenceInstances", os + value("Role", "Nobody"), "References",
         osObject + value("Role", "Nobody")},
        {"OpenReferenceInstancePaths", os, "ReferenceNames", osObject},
    };
    for (const Row& row : rows) {
        const Names expected = objectsIn(respond(operation(row.ordinary, row.ordinaryParameters)));
        const std::string all =
            answerOf(shippedManager(), row.open, row.parameters + most(10000), "root/cimv2");
        EXPECT_EQ(objectsIn(all), expected) << row.open;
        EXPECT_EQ(valueOf(all, "EndOfSequence"), "TRUE");
        EXPECT_EQ(contextOf(all), "");
        // One by one.
        const bool paths = std::string(row.open).find("Paths") != std::string::npos;
        Names pulled;
        std::string answer = answerOf(shippedManager(), row.open, row.parameters, "root/cimv2");
        EXPECT_EQ(objectsIn(answer), Names());
        for (unsigned pulls = 0; pulls < 100 && valueOf(answer, "EndOfSequence") == "FALSE";
             ++pulls) {
            answer = respond(operation(paths ? "PullInstancePaths" : "PullInstancesWithPath",
                                       continued(contextOf(answer), 1)));
            for (const std::string& each : objectsIn(answer)) pulled.push_back(each);
        }
        EXPECT_EQ(pulled, expected) << row.open;
    }
}

TEST(PullOperations, AnswerInTheFormsThatClientsRead) {
    const std::string path =
        "<INSTANCEPATH><NAMESPACEPATH><HOST>server.example</HOST><LOCALNAMESPACEPATH><NAMESPACE "
        "NAME=\"root\"/><NAMESPACE NAME=\"test\"/></LOCALNAMESPACEPATH></NAMESPACEPATH>"
        "<INSTANCENAME CLASSNAME=\"TEST_Thing\"><KEYBINDING NAME=\"Name\"><KEYVALUE "
        "VALUETYPE=\"string\">first</KEYVALUE></KEYBINDING></INSTANCENAME></INSTANCEPATH>";
    const std::string instance =
        "<VALUE.INSTANCEWITHPATH>" + path +
        "<INSTANCE CLASSNAME=\"TEST_Thing\"><PROPERTY NAME=\"Name\" TYPE=\"string\">"
        "<VALUE>first</VALUE></PROPERTY></INSTANCE></VALUE.INSTANCEWITHPATH>";
    const std::string ended =
        "<PARAMVALUE NAME=\"EnumerationContext\" PARAMTYPE=\"string\"><VALUE></VALUE></PARAMVALUE>"
        "<PARAMVALUE NAME=\"EndOfSequence\" PARAMTYPE=\"boolean\"><VALUE>TRUE</VALUE></PARAMVALUE>";
    const std::string open =
        "<PARAMVALUE NAME=\"EnumerationContext\" PARAMTYPE=\"string\"><VALUE>[0-9a-f]{32}</VALUE>"
        "</PARAMVALUE><PARAMVALUE NAME=\"EndOfSequence\" PARAMTYPE=\"boolean\"><VALUE>FALSE</VALUE>"
        "</PARAMVALUE>";
    const std::string names = list("PropertyList", {"Name"});
    ObjectManager& manager = newForeignManager();
    const auto asked = [&](const std::string& name, const std::string& parameters) {
        return answerOf(manager, name, parameters);
    };
    EXPECT_EQ(content(asked("OpenEnumerateInstances", things + names + most(1))),
              "<IRETURNVALUE>" + instance + "</IRETURNVALUE>" + ended);
    EXPECT_EQ(content(asked("OpenEnumerateInstancePaths", things + most(1))),
              "<IRETURNVALUE>" + path + "</IRETURNVALUE>" + ended);
    for (const auto& [opening, pulling, result] :
         {std::tuple("OpenEnumerateInstances", "PullInstancesWithPath", instance),
          std::tuple("OpenEnumerateInstancePaths", "PullInstancePaths", path)}) {
        const bool paths = result == path;
        const std::string first = asked(opening, things + (paths ? "" : names));
        EXPECT_THAT(content(first), MatchesRegex("<IRETURNVALUE></IRETURNVALUE>" + open));
        EXPECT_EQ(content(asked(pulling, continued(contextOf(first), 1))),
                  "<IRETURNVALUE>" + result + "</IRETURNVALUE>" + ended);
    }
    const std::string closed = asked("OpenEnumerateInstances", things);
    EXPECT_EQ(content(asked("CloseEnumeration", value("EnumerationContext", contextOf(closed)))),
              "");
}

TEST(PullOperations, KeepTheOrderAndTheCountThatWasAskedFor) {
    ObjectManager& manager = managerOfThings();
    const auto asked = [&](const std::string& name, const std::string& parameters) {
        return answerOf(manager, name, parameters);
    };
    const std::string first = asked("OpenEnumerateInstancePaths", things + most(2));
    EXPECT_EQ(objectsIn(first), (Names{"TEST_Thing(first)", "TEST_Thing(second)"}));
    // What is created or deleted meanwhile does not count.
    asked("DeleteInstance",
          parameter("InstanceName", instanceName("TEST_Thing", {{"Name", "third"}})));
    const std::string context = contextOf(first);
    const std::string second = asked("PullInstancePaths", continued(context, 2));
    EXPECT_EQ(objectsIn(second), (Names{"TEST_Thing(third)", "TEST_Thing(fourth)"}));
    EXPECT_EQ(valueOf(second, "EndOfSequence"), "FALSE");
    EXPECT_EQ(contextOf(second), context);
    EXPECT_EQ(objectsIn(asked("PullInstancePaths", continued(context, 0))), Names());
    const std::string last = asked("PullInstancePaths", continued(context, 2));
    EXPECT_EQ(objectsIn(last), Names{"TEST_Thing(fifth)"});
    EXPECT_EQ(valueOf(last, "EndOfSequence"), "TRUE");
    EXPECT_THAT(error(asked("PullInstancePaths", continued(context, 2))), StartsWith("21: "));
}

/// A request that fails, and the status.
struct Refusal {
    const char* name;
    std::string parameters;
    const char* status;
};

TEST(PullOperations, RefuseWhatIsWrongOrNotServed) {
    const std::string os = parameter("InstanceName", operatingSystem());
    const std::string cim = className("ClassName", "CIM_OperatingSystem");
    const std::string context = value("EnumerationContext", "0123456789abcdef0123456789abcdef");
    const Refusal rows[] = {
        {"OpenEnumerateInstances", className("ClassName", "KORVA_Foo"), "5: "},
        {"OpenEnumerateInstancePaths", className("ClassName", "KORVA_Foo"), "5: "},
        {"OpenAssociatorInstances",
         parameter("InstanceName", instanceName("KORVA_Foo", {{"Name", "x"}})), "4: "},
        {"OpenReferenceInstancePaths", os + className("ResultClass", "KORVA_Foo"), "4: "},
        {"OpenAssociatorInstances",
         parameter("InstanceName",
                   "<INSTANCENAME CLASSNAME=\"KORVA_OperatingSystem\"></INSTANCENAME>"),
         "4: "},
        {"OpenAssociatorInstances", className("InstanceName", "KORVA_OperatingSystem"), "4: "},
        {"OpenAssociatorInstances", parameter("ObjectName", operatingSystem()), "4: "},
        {"OpenEnumerateInstances", "", "4: "},
        {"OpenEnumerateInstances", cim + most(10001), "4: "},
        {"OpenEnumerateInstances", cim + value("MaxObjectCount", "-1"), "4: "},
        {"OpenEnumerateInstances", cim + value("MaxObjectCount", "many"), "4: "},
        {"OpenEnumerateInstances", cim + value("OperationTimeout", "0"), "22: "},
        {"OpenEnumerateInstances", cim + value("OperationTimeout", "91"), "22: "},
        {"OpenEnumerateInstances", cim + value("FilterQuery", "Name = 'x'"), "25: "},
        {"OpenReferenceInstances", os + value("FilterQueryLanguage", "DMTF:FQL"), "25: "},
        {"OpenAssociatorInstancePaths", os + value("ContinueOnError", "TRUE"), "26: "},
        {"OpenQueryInstances",
         value("FilterQueryLanguage", "DMTF:CQL") + value("FilterQuery", "SELECT * FROM X"), "7: "},
        {"EnumerationCount", context, "7: "},
        {"PullInstances", context + most(1), "21: "},
        {"PullInstancesWithPath", context + most(1), "21: "},
        {"PullInstancePaths", context + most(10001), "4: "},
        {"PullInstancePaths", context, "4: "},
        {"PullInstancePaths", most(1), "4: "},
        {"CloseEnumeration", context, "21: "},
        {"CloseEnumeration", "", "4: "},
    };
    for (const Refusal& row : rows)
        EXPECT_THAT(error(answerOf(shippedManager(), row.name, row.parameters, "root/cimv2")),
                    StartsWith(row.status))
            << row.name << row.parameters;
    for (const char* const timeout : {"1", "90"})
        EXPECT_EQ(error(respond(operation("OpenEnumerateInstances",
                                          cim + value("OperationTimeout", timeout) + most(9) +
                                              value("ContinueOnError", "false")))),
                  "");
    EXPECT_THAT(error(respond(operation("OpenEnumerateInstances", cim, "root/nowhere"))),
                StartsWith("3: "));
}

TEST(PullOperations, ServeAContextToItsUserInItsNamespaceOnly) {
    ObjectManager& manager = newForeignManager();
    const auto asked = [&](const std::string& name, const std::string& parameters,
                           const std::optional<std::string>& user,
                           const std::string& nameSpace = "root/test") {
        return answerOf(manager, name, parameters, nameSpace, user);
    };
    const std::string context = contextOf(asked("OpenEnumerateInstancePaths", things, "anna"));
    const std::string one = continued(context, 1);
    EXPECT_THAT(error(asked("PullInstancePaths", one, "berta")), StartsWith("21: "));
    EXPECT_THAT(error(asked("PullInstancePaths", one, {})), StartsWith("21: "));
    EXPECT_THAT(error(asked("PullInstancePaths", one, "anna", "root/other")), StartsWith("21: "));
    EXPECT_THAT(error(asked("PullInstancesWithPath", one, "anna")), StartsWith("21: "));
    EXPECT_THAT(error(asked("CloseEnumeration", value("EnumerationContext", context), "berta")),
                StartsWith("21: "));
    EXPECT_EQ(objectsIn(asked("PullInstancePaths", one, "anna", "ROOT/Test")),
              Names{"TEST_Thing(first)"});
}

TEST(PullOperations, RefuseThe65thThatIsLeftOpen) {
    ObjectManager& manager = newForeignManager();
    const std::string request = operation("OpenEnumerateInstances", things, "root/test");
    std::string context;
    for (int number = 0; number < 64; ++number) context = contextOf(respond(manager, request));
    EXPECT_THAT(error(respond(manager, request)), StartsWith("27: "));
    const std::string close =
        operation("CloseEnumeration", value("EnumerationContext", context), "root/test");
    EXPECT_EQ(error(respond(manager, close)), "");
    EXPECT_THAT(error(respond(manager, close)), StartsWith("21: "));
    EXPECT_EQ(error(respond(manager, request)), "");
}

TEST(PullOperations, OfEightThreadsGiveEachResultOnce) {
    ObjectManager& manager = managerOfThings();
    for (int round = 0; round < 20; ++round) {
        const std::string opened =
            respond(manager, operation("OpenEnumerateInstancePaths", things, "root/test"));
        const std::string pull =
            operation("PullInstancePaths", continued(contextOf(opened), 1), "root/test");
        std::atomic<std::size_t> found = 0;
        std::vector<std::thread> threads;
        for (int thread = 0; thread < 8; ++thread) {
            threads.emplace_back([&] {
                const std::string answer = respond(manager, pull);
                const std::string failure = error(answer);
                if (failure.empty()) {
                    found += count(answer, "<INSTANCEPATH>");
                } else {
                    EXPECT_THAT(failure, StartsWith("21: "));
                }
            });
        }
        for (std::thread& thread : threads) thread.join();
        EXPECT_EQ(found, 5U);
    }
}

}  // namespace
}  // namespace cmpihost::server::pull_tests
