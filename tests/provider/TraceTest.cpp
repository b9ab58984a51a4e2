#include "Trace.h"

#include <gtest/gtest.h>

#include <string>

#include "support/RecordingLog.h"

namespace {

constexpr auto noKind = static_cast<VA::MessageType>(4);

TEST(Trace, EachKindHasItsFormat) {
    EXPECT_STREQ(VA::trace("A", "B", 7, VA::Entering), "ENTERING: B() in A [Line: 7]");
    EXPECT_STREQ(VA::trace("A", "B", 7, VA::Exiting), "EXITING: B() in A [Line: 7]");
    EXPECT_STREQ(VA::trace("A", "B", 7, VA::Method), "METHOD: B() was invoked in A [Line: 7]");
    EXPECT_STREQ(VA::trace("A", "B", 9, VA::Message), "MESSAGE [File: A, Line: 9]: B");
}

TEST(Trace, KindsAreNumberedFromZero) {
    EXPECT_EQ(VA::Entering, 0U);
    EXPECT_EQ(VA::Exiting, 1U);
    EXPECT_EQ(VA::Method, 2U);
    EXPECT_EQ(VA::Message, 3U);
}

TEST(Trace, KindThatIsNoneGivesTheEmptyText) {
    VA::trace("A", "B", 7, VA::Method);
    EXPECT_STREQ(VA::trace("A", "B", 7, noKind), "");
    VA::tracepara("A", "G", 3, "P", VA::Entering);
    EXPECT_STREQ(VA::tracepara("A", "G", 3, "P", noKind), "");
}

TEST(Trace, VariableRecordNamesTheFileLast) {
    EXPECT_STREQ(VA::trace("classId", "A", 68, 55U),
                 "VARIABLE: 'classId' has Value '55' at line 68 in A");
    EXPECT_STREQ(VA::trace("CSName", "A", 68, "host1"),
                 "VARIABLE: 'CSName' has Value 'host1' at line 68 in A");
}

TEST(Trace, NumberOfAVariableIsPrintedSigned) {
    EXPECT_STREQ(VA::trace("n", "A", 1, 4294967295U),
                 "VARIABLE: 'n' has Value '-1' at line 1 in A");
    EXPECT_STREQ(VA::trace("n", "A", 4294967295U, 0U),
                 "VARIABLE: 'n' has Value '0' at line -1 in A");
}

TEST(Trace, ParameterListFollowsTheCommaWithoutABlank) {
    EXPECT_STREQ(VA::tracepara("A", "G", 3, "P", VA::Entering),
                 "ENTERING: G() in A [Line: 3],Parameters List: P");
    EXPECT_STREQ(VA::tracepara("A", "G", 3, "P", VA::Exiting),
                 "EXITING: G() in A [Line: 3],Parameters List: P");
    EXPECT_STREQ(VA::tracepara("A", "G", 3, "P", VA::Method),
                 "METHOD: G() was invoked in A [Line: 3],Parameters List: P");
    EXPECT_STREQ(VA::tracepara("A", "G", 3, "P", VA::Message),
                 "MESSAGE [File: A, Line: 3]: G,Parameters List: P");
}

TEST(Trace, EachFunctionOwnsOneBufferForAllItsTexts) {
    const char* first = VA::trace("A", "B", 7, VA::Entering);
    EXPECT_EQ(VA::trace("C", "D", 8, VA::Message), first);
    const char* text = VA::trace("n", "A", 1, "v");
    const char* number = VA::trace("n", "A", 1, 1U);
    const char* list = VA::tracepara("A", "G", 3, "P", VA::Entering);
    EXPECT_NE(first, text);
    EXPECT_NE(first, number);
    EXPECT_NE(first, list);
    EXPECT_NE(text, number);
    EXPECT_NE(text, list);
    EXPECT_NE(number, list);
}

TEST(Trace, TextThatFitsIsExactAndALongerOneIsCutAt511Characters) {
    const std::string frame = "MESSAGE [File: A, Line: 1]: ";
    const std::string fits(511 - frame.size(), 'x');
    EXPECT_EQ(VA::trace("A", fits.c_str(), 1, VA::Message), frame + fits);
    const std::string longer = fits + "y";
    EXPECT_EQ(VA::trace("A", longer.c_str(), 1, VA::Message), frame + fits);
    const std::string huge(100000, 'z');
    EXPECT_EQ(std::string(VA::trace("n", "A", 1, huge.c_str())).size(), 511U);
    EXPECT_EQ(std::string(VA::trace(huge.c_str(), "A", 1, 1U)).size(), 511U);
    EXPECT_EQ(std::string(VA::tracepara("A", "G", 1, huge.c_str(), VA::Exiting)).size(), 511U);
}

TEST(Trace, BufferIsZeroedBeforeEachUse) {
    const char* buffer = VA::trace("A", std::string(600, 'x').c_str(), 1, VA::Message);
    VA::trace("A", "B", 1, VA::Method);
    const std::string text = "METHOD: B() was invoked in A [Line: 1]";
    ASSERT_EQ(buffer, text);
    for (std::size_t index = text.size(); index < 512; ++index) EXPECT_EQ(buffer[index], '\0');
}

TEST(Trace, PercentSignsOfATextAreNotInterpreted) {
    EXPECT_STREQ(VA::trace("A", "%n%s%d", 9, VA::Message), "MESSAGE [File: A, Line: 9]: %n%s%d");
    EXPECT_STREQ(VA::trace("n", "A", 1, "%n"), "VARIABLE: 'n' has Value '%n' at line 1 in A");
}

TEST(Trace, RecordIsFormattedOnceForEachChannelAndCarriesNineArguments) {
    recording::clear();
    int formatted = 0;
    VA::writeRecord("function", "File.cpp", 17, "Category", 4000, [&formatted] {
        ++formatted;
        return "text";
    });
    const auto records = recording::take();
    EXPECT_EQ(formatted, 2);
    ASSERT_EQ(records.size(), 2U);
    EXPECT_EQ(records[0].channel, "log");
    EXPECT_EQ(records[1].channel, "trace");
    EXPECT_TRUE(recording::sameArguments(records[0], records[1]));
    EXPECT_EQ(records[0].function, "function");
    EXPECT_EQ(records[0].file, "File.cpp");
    EXPECT_EQ(records[0].line, 17);
    EXPECT_EQ(records[0].category, "Category");
    EXPECT_EQ(records[0].level, 4000);
    EXPECT_TRUE(records[0].reservedIsNull);
    EXPECT_EQ(records[0].reserved1, 0);
    EXPECT_EQ(records[0].reserved2, 0);
    EXPECT_EQ(records[0].text, "text");
}

TEST(Trace, EntryMarkerWritesTheBannerThenTheEnteringRecord) {
    recording::clear();
    VA::markProviderEntry("Category", "File.cpp", "handler", 12);
    const auto records = recording::take();
    ASSERT_EQ(records.size(), 4U);
    EXPECT_EQ(records[0].text,
              "==============================================================================");
    EXPECT_EQ(records[0].text.size(), 78U);
    EXPECT_EQ(records[2].text, "ENTERING: handler() in File.cpp [Line: 12]");
    EXPECT_EQ(recording::rendered(records),
              "both markProviderEntry include/Trace.h:336 Category 4000 null 0 0 | "
              "==============================================================================\n"
              "both markProviderEntry include/Trace.h:337 Category 4000 null 0 0 | "
              "ENTERING: handler() in File.cpp [Line: #]\n");
}

TEST(Trace, ExitMarkerWritesTheExitingRecordThenTheBanner) {
    recording::clear();
    VA::markProviderExit("Category", "File.cpp", "handler", 12);
    const auto records = recording::take();
    ASSERT_EQ(records.size(), 4U);
    EXPECT_EQ(records[0].text, "EXITING: handler() in File.cpp [Line: 12]");
    EXPECT_EQ(recording::rendered(records),
              "both markProviderExit include/Trace.h:348 Category 4000 null 0 0 | "
              "EXITING: handler() in File.cpp [Line: #]\n"
              "both markProviderExit include/Trace.h:349 Category 4000 null 0 0 | "
              "==============================================================================\n");
}

}  // namespace
