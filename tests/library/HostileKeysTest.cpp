#include "library/LibraryFixture.h"

namespace {

using namespace cmpihost;
using testing::IsEmpty;

class HostileKeys : public LibraryFixture {
  protected:
    // The texts of the variable records of the key "Name" that a request leaves in one channel.
    std::vector<std::string> nameRecords(const std::string& value) {
        recording::clear();
        const Outcome outcome = get(operatingSystemPath("host1", value));
        EXPECT_EQ(outcome.rc, CMPI_RC_OK);
        EXPECT_EQ(outcome.doneCount, 1U);
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
    for (const recording::Record& record : recording::take()) EXPECT_LE(record.text.size(), 511U);
}

}  // namespace
