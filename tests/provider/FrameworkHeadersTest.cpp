#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <type_traits>

#include "FrameworkException.h"
#include "InstrumentationException.h"
#include "ProviderException.h"
#include "Trace.h"
#include "support/RecordingLog.h"

// What the headers of include/ define themselves: the texts of records, and the exceptions.

namespace {

TEST(Trace, EachKindHasItsFormat) {
    const struct {
        VA::MessageType kind;
        const char* text;
    } rows[] = {
        {VA::Entering, "ENTERING: B() in A [Line: 7]"},
        {VA::Exiting, "EXITING: B() in A [Line: 7]"},
        {VA::Method, "METHOD: B() was invoked in A [Line: 7]"},
        {VA::Message, "MESSAGE [File: A, Line: 7]: B"},
        {static_cast<VA::MessageType>(4), nullptr},  // of no kind: the empty text
    };
    unsigned int number = 0;
    for (const auto& row : rows) {
        EXPECT_EQ(row.kind, number++);
        const std::string text = row.text == nullptr ? "" : row.text;
        EXPECT_EQ(VA::trace("A", "B", 7, row.kind), text);
        // No blank follows the comma.
        EXPECT_EQ(VA::tracepara("A", "B", 7, "P", row.kind),
                  text.empty() ? "" : text + ",Parameters List: P");
    }
}

TEST(Trace, VariableRecordNamesTheFileLastAndPrintsNumbersSigned) {
    EXPECT_STREQ(VA::trace("classId", "A", 68, 55U),
                 "VARIABLE: 'classId' has Value '55' at line 68 in A");
    EXPECT_STREQ(VA::trace("CSName", "A", 68, "host1"),
                 "VARIABLE: 'CSName' has Value 'host1' at line 68 in A");
    EXPECT_STREQ(VA::trace("n", "A", 1, 4294967295U),
                 "VARIABLE: 'n' has Value '-1' at line 1 in A");
    EXPECT_STREQ(VA::trace("n", "A", 4294967295U, 0U),
                 "VARIABLE: 'n' has Value '0' at line -1 in A");
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
    EXPECT_EQ(formatted, 2);
    const auto records = recording::take();
    ASSERT_EQ(records.size(), 2U);
    EXPECT_EQ(records[0].channel, "log");
    EXPECT_EQ(records[1].channel, "trace");
    EXPECT_EQ(records[0].line, 17);
    EXPECT_EQ(recording::rendered(records),
              "both function File.cpp:# Category 4000 null 0 0 | text\n");
}

TEST(Trace, MarkersFrameARequestWithTheBannerOutside) {
    recording::clear();
    VA::markProviderEntry("Category", "File.cpp", "handler", 12);
    VA::markProviderExit("Category", "File.cpp", "handler", 12);
    const auto records = recording::take();
    ASSERT_EQ(records.size(), 8U);
    EXPECT_EQ(records[2].text, "ENTERING: handler() in File.cpp [Line: 12]");
    EXPECT_EQ(records[4].text, "EXITING: handler() in File.cpp [Line: 12]");
    const std::string banner(78, '=');
    EXPECT_EQ(recording::rendered(records),
              "both markProviderEntry include/Trace.h:336 Category 4000 null 0 0 | " + banner +
                  "\nboth markProviderEntry include/Trace.h:337 Category 4000 null 0 0 | "
                  "ENTERING: handler() in File.cpp [Line: #]\n"
                  "both markProviderExit include/Trace.h:348 Category 4000 null 0 0 | "
                  "EXITING: handler() in File.cpp [Line: #]\n"
                  "both markProviderExit include/Trace.h:349 Category 4000 null 0 0 | " +
                  banner + "\n");
}

template <class Exception>
class Exceptions : public testing::Test {};

using All =
    testing::Types<VA::FrameworkException, VA::ProviderException, VA::InstrumentationException>;
TYPED_TEST_SUITE(Exceptions, All, );

TYPED_TEST(Exceptions, CarryTheExactTextEachCopyItsOwn) {
    auto text = std::make_unique<std::string>("Could not find 'Name' Key in Moniker");
    auto original = std::make_unique<TypeParam>(text->c_str());
    text.reset();
    const TypeParam copy(*original);
    EXPECT_NE(copy.what(), original->what());
    EXPECT_STREQ(original->what(), "Could not find 'Name' Key in Moniker");
    original.reset();
    EXPECT_STREQ(copy.what(), "Could not find 'Name' Key in Moniker");
}

TYPED_TEST(Exceptions, AreStandardExceptionsAndNoneOfTheOthers) {
    try {
        throw TypeParam("Object Not Found.");
    } catch (const std::exception& caught) {
        EXPECT_STREQ(caught.what(), "Object Not Found.");
    }
    constexpr int bases = std::is_base_of_v<VA::FrameworkException, TypeParam> +
                          std::is_base_of_v<VA::ProviderException, TypeParam> +
                          std::is_base_of_v<VA::InstrumentationException, TypeParam>;
    EXPECT_EQ(bases, 1);
}

}  // namespace
