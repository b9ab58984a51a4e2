#include "host/cli/Suggestion.h"

#include <gmock/gmock.h>

namespace {

using namespace cmpihost;
using testing::ElementsAre;
using testing::IsEmpty;

const std::vector<std::string> classes = {"KORVA_OperatingSystem",
                                          "KORVA_OperatingSystemCapabilities", "KORVA_RunningOS",
                                          "CIM_OperatingSystem", "KORVA_InstalledOS"};

TEST(Suggestion, FindsTheNearestNameInSpiteOfCaseAndSlips) {
    const std::string expected = "KORVA_OperatingSystem";
    for (const char* written :
         {"KORVA_OperatingSytem", "korva_operatingsystem", "KORVA_OperatingSys",
          "KORVAOperatingSystem", "KORVA_OpreatingSystem"}) {
        EXPECT_THAT(nearestNames(written, classes), ElementsAre(expected)) << written;
    }
    EXPECT_THAT(nearestNames("Versoin", {"Version", "Name"}), ElementsAre("Version"));
}

TEST(Suggestion, FindsAClassWithoutItsPrefixOrWithAnother) {
    EXPECT_THAT(nearestNames("operatingsystem", classes),
                ElementsAre("CIM_OperatingSystem", "KORVA_OperatingSystem"));
    EXPECT_THAT(nearestNames("runningos", classes), ElementsAre("KORVA_RunningOS"));
    EXPECT_THAT(nearestNames("CIM_RunningOS", classes), ElementsAre("KORVA_RunningOS"));
    EXPECT_THAT(nearestNames("Linux_InstaledOS", classes), ElementsAre("KORVA_InstalledOS"));
}

TEST(Suggestion, SuggestsNothingThatIsFarAndNoMoreThanThree) {
    for (const char* written : {"Thing", "KORVA_Unknown", "", "x"})
        EXPECT_THAT(nearestNames(written, classes), IsEmpty()) << written;
    EXPECT_THAT(nearestNames("ex", {"ei", "en", "ez", "ew", "qq"}), ElementsAre("ei", "en", "ew"));
    EXPECT_THAT(nearestNames("z", {"a"}), IsEmpty());
}

TEST(Suggestion, EndsAComplaintWithAQuestion) {
    EXPECT_EQ(didYouMean("tre", {"tree", "ei"}), "; did you mean tree?");
    EXPECT_EQ(didYouMean("eo", {"ei", "en"}), "; did you mean ei or en?");
    EXPECT_EQ(didYouMean("eo", {"ei", "en", "ez"}), "; did you mean ei, en or ez?");
    EXPECT_EQ(didYouMean("far", {"ei"}), "");
}

}  // namespace
