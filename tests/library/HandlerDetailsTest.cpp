// What only a close look at a request shows: lines of records, questions to the host, destructors
// that throw, and key values that a client chose to do harm.
#include <algorithm>
#include <fstream>
#include <iterator>
#include <stdexcept>

#include "library/LibraryFixture.h"
#include "support/Properties.h"

namespace {

using namespace cmpihost;
using testing::HasSubstr;
using testing::IsEmpty;

class HandlerDetails : public LibraryFixture {};

TEST_F(HandlerDetails, EveryInstanceCarriesAnEmptyDescriptionAndTheStatusOK) {
    setNodes({"a", "b", "c"});
    const Outcome outcome = enumerate("KORVA_OperatingSystem");
    ASSERT_EQ(outcome.instances.size(), 3U);
    for (const InstanceValue& instance : outcome.instances) {
        EXPECT_EQ(text(instance, "Description"), "");
        EXPECT_EQ(text(instance, "Status"), "OK");
    }
}

TEST_F(HandlerDetails, PropertyListReachesTheAdapterAsItCame) {
    for (const Operation operation : {Operation::EnumerateInstances, Operation::GetInstance}) {
        OperationRequest asked = requestFor(operation, operatingSystemPath("host1", "Linux"));
        recording::clear();
        invoke(asked);
        EXPECT_THAT(recording::takeRendered(), HasSubstr("properties=0\n"));
        asked.properties = std::vector<std::string>{"Name"};
        invoke(asked);
        EXPECT_THAT(recording::takeRendered(), HasSubstr("properties=0x*\n"));
    }
}

TEST_F(HandlerDetails, TextOfAnExceptionIsAskedForOnceAChannel) {
    struct Counting : std::exception {
        const char* what() const noexcept override { return asked++ == 0 ? "first" : "second"; }
        mutable int asked = 0;
    };
    host->throwFromCall(VA::SimulatedHost::Operation::Select, 1, Counting());
    enumerateNames("KORVA_OperatingSystem");
    std::string texts;
    for (const recording::Record& record : recording::take())
        if (record.text.rfind("MESSAGE ", 0) == 0)
            texts += record.channel + record.text.substr(record.text.find("]:") + 2) + ";";
    EXPECT_EQ(texts, "log first;trace second;");
}

TEST_F(HandlerDetails, LineOfARecordIsTheOneInItsText) {
    const OperationRequest requests[] = {
        requestFor(Operation::EnumerateInstances, path("KORVA_OperatingSystem")),
        requestFor(Operation::EnumerateInstances, path("KORVA_RunningOS")),
        requestFor(Operation::Associators, operatingSystemPath("host1", "Linux"),
                   "KORVA_OSElementCapabilities")};
    for (const OperationRequest& each : requests) {
        invoke(each);
        for (const recording::Record& record : recording::take()) {
            EXPECT_GT(record.line, 0);
            if (record.file == "include/Trace.h") continue;
            const std::string line = std::to_string(record.line);
            EXPECT_TRUE(record.text.find("Line: " + line + "]") != std::string::npos ||
                        record.text.find("at line " + line + " in") != std::string::npos)
                << record.text;
        }
    }
}

// The function of the provider's handlers in whose body a line of its source stands.
std::string functionAround(unsigned long line) {
    std::ifstream source(KORVA_SOURCE_DIR "/provider/OperatingSystemProvider.cpp");
    const std::string start = "static CMPIStatus ";
    std::string function = "(none)";
    std::string text;
    for (unsigned long number = 1; number <= line && std::getline(source, text); ++number)
        if (text.rfind(start, 0) == 0)
            function = text.substr(start.size(), text.find('(') - start.size());
        else if (text == "}" && number < line)
            function = "(none)";
    return function;
}

TEST_F(HandlerDetails, MarkersBearALineOfTheHandlersOwn) {
    for (const NamedRequest& each : oneRequestOfEachHandler()) {
        recording::clear();
        invoke(each.request);
        unsigned int markers = 0;
        for (const recording::Record& record : recording::take()) {
            const std::size_t found = record.text.find(" [Line: ");
            if (record.file != "include/Trace.h" || found == std::string::npos) continue;
            ++markers;
            const std::size_t begin = record.text.find(": ") + 2;
            EXPECT_EQ(functionAround(std::stoul(record.text.substr(found + 8))),
                      record.text.substr(begin, record.text.find('(') - begin))
                << record.text;
        }
        EXPECT_EQ(markers, 4U);
    }
}

TEST_F(HandlerDetails, EachCursorSelectsItsNodesOnce) {
    enumerate("KORVA_OperatingSystem");
    EXPECT_EQ(host->calls(VA::SimulatedHost::Operation::Select), 1U);
    enumerate("KORVA_OSElementCapabilities");
    EXPECT_EQ(host->calls(VA::SimulatedHost::Operation::Select), 3U);
}

TEST_F(HandlerDetails, OnlyThePropertiesOfTheClassesAreAskedFor) {
    host->setHook([](const VA::SimulatedHost::Call& call) {
        if (!call.id) return;
        EXPECT_TRUE(std::any_of(std::begin(operatingSystemProperties),
                                std::end(operatingSystemProperties),
                                [&](const PublishedProperty& each) { return each.id == *call.id; }))
            << *call.id;
    });
    for (const char* className : {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities",
                                  "KORVA_OSElementCapabilities"})
        enumerate(className);
    host->setHook({});
}

// Records fail in every destructor of an adapter or element: the first failure is reported, and
// what was returned before it stays.
TEST_F(HandlerDetails, ExceptionsFromEveryDestructorAreReportedAsOne) {
    recording::setHook([](const recording::Record& record) {
        if (record.function[0] == '~') throw std::runtime_error("from a destructor");
    });
    recording::clear();
    const Outcome outcome = enumerateNames("KORVA_OSElementCapabilities");
    expectDone(outcome);
    EXPECT_EQ(outcome.paths.size(), 1U);
    const std::string records = recording::takeRendered();
    const std::string message = "]: from a destructor\n";
    EXPECT_NE(records.find(message), std::string::npos);
    EXPECT_EQ(records.find(message), records.rfind(message));
    EXPECT_THAT(records, HasSubstr("markProviderExit"));
}

class HostileKeys : public LibraryFixture {
  protected:
    // The texts of the variable records of the key "Name" that a request leaves in one channel.
    std::vector<std::string> nameRecords(const std::string& value) {
        recording::clear();
        const Outcome outcome = get(operatingSystemPath("host1", value));
        expectDone(outcome);
        EXPECT_THAT(outcome.instances, IsEmpty());
        std::vector<std::string> found;
        for (const recording::Record& record : recording::take()) {
            EXPECT_LE(record.text.size(), 511U);
            if (record.channel == "log" && record.text.rfind("VARIABLE: 'Name'", 0) == 0)
                found.push_back(record.text);
        }
        return found;
    }
};

TEST_F(HostileKeys, ValueOfAnyLengthLeavesOneRecordOfAtMost511Characters) {
    for (const std::size_t length : {std::size_t{0}, std::size_t{511}, std::size_t{512},
                                     std::size_t{513}, std::size_t{100000}}) {
        const std::string value(length, 'x');
        const std::vector<std::string> records = nameRecords(value);
        ASSERT_EQ(records.size(), 1U) << length;
        const std::string whole = "VARIABLE: 'Name' has Value '" + value + "' at line ";
        EXPECT_EQ(records[0].substr(0, whole.size()), whole.substr(0, 511)) << length;
    }
}

TEST_F(HostileKeys, ContentIsRecordedAsItIs) {
    for (const std::string& value :
         {std::string("%s%n%1000000d%%"), std::string("line\nbreak\r\x1b[31m\x07"),
          std::string("\xff\xfe\xc0\x80"), std::string("' at line 1 in Other.cpp"),
          std::string("\"quoted\\\"")}) {
        const std::vector<std::string> records = nameRecords(value);
        ASSERT_EQ(records.size(), 1U);
        EXPECT_EQ(records[0].rfind("VARIABLE: 'Name' has Value '" + value + "' at line ", 0), 0U);
    }
}

TEST_F(HostileKeys, ValueThatEndsInABlankOrDiffersInOneByteFindsNothing) {
    for (const char* value : {"Linux ", " Linux", "Linu", "Linux\t", "Linux\xff"})
        EXPECT_EQ(nameRecords(value).size(), 1U);
}

TEST_F(HostileKeys, ManyKeysAreOnlyPassedOver) {
    ObjectPathValue asked = path("KORVA_OperatingSystem");
    for (int count = 0; count < 70000; ++count)
        asked.keys.push_back({"Key" + std::to_string(count), "value"});
    EXPECT_EQ(get(asked).instances.size(), 1U);
}

TEST_F(HostileKeys, SourceOfAnAssociationIsMappedWhateverItHolds) {
    for (const std::string& value :
         {std::string(), std::string(100000, 'x'), std::string("%n\xff\n'\"\\")}) {
        EXPECT_EQ(associatorNames(operatingSystemPath(value, value), "KORVA_RunningOS").rc,
                  CMPI_RC_OK);
        EXPECT_EQ(associatorNames(computerSystemPath(value), "KORVA_InstalledOS").rc, CMPI_RC_OK);
        EXPECT_EQ(associators(capabilitiesPath(value), "KORVA_OSElementCapabilities").rc,
                  CMPI_RC_OK);
    }
    // None of them is the name of the node.
    EXPECT_EQ(broker.takeViolations(),
              std::vector<std::string>(3, "path of KORVA_OperatingSystem without key Name"));
    const std::vector<recording::Record> records = recording::take();
    EXPECT_FALSE(records.empty());
    for (const recording::Record& record : records) EXPECT_LE(record.text.size(), 511U);
}

}  // namespace
