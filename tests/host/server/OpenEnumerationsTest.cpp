#include "host/server/OpenEnumerations.h"

#include "host/server/CimError.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <atomic>
#include <set>
#include <thread>
#include <vector>

namespace cmpihost::server {
namespace {

using std::chrono::seconds;

/// Elements that are letters in angle brackets: <a><b><c>.
WrittenResults letters(std::size_t count) {
    WrittenResults results;
    for (std::size_t index = 0; index < count; ++index) {
        results.xml += '<';
        results.xml += static_cast<char>('a' + index % 26);
        results.xml += '>';
        results.ends.push_back(results.xml.size());
    }
    return results;
}

class OpenEnumerationsTest : public ::testing::Test {
  protected:
    OpenEnumerations::Clock::time_point now{};
    OpenEnumerations enumerations{[this] { return now; }};
    const EnumerationOwner anna{"anna", "root/cimv2"};

    Piece opened(std::size_t results, std::size_t count = 0, seconds timeout = seconds(30)) {
        return enumerations.open(anna, PulledKind::InstancePaths, letters(results), count, timeout);
    }
    Piece pulled(const std::string& context, std::size_t count) {
        return enumerations.pull(context, anna, PulledKind::InstancePaths, count);
    }
    /// The status with which a call ends, 0 for none.
    template <class Function>
    static unsigned status(Function function) {
        try {
            function();
            return 0;
        } catch (const CimError& error) {
            EXPECT_STRNE(error.what(), "");
            return error.code();
        }
    }
};

TEST_F(OpenEnumerationsTest, WhatFitsIntoTheFirstPieceIsNotOpen) {
    for (const std::size_t count : {3U, 4U}) {
        const Piece all = opened(3, count);
        EXPECT_EQ(all.xml, "<a><b><c>");
        EXPECT_EQ(all.context, "");
    }
    EXPECT_EQ(opened(0).context, "");
    EXPECT_EQ(enumerations.size(), 0U);
}

TEST_F(OpenEnumerationsTest, ThePiecesAreTheResultsInTheirOrder) {
    const Piece first = opened(6, 1);
    EXPECT_EQ(first.xml, "<a>");
    EXPECT_EQ(enumerations.size(), 1U);
    EXPECT_EQ(pulled(first.context, 2).xml, "<b><c>");
    const Piece none = pulled(first.context, 0);
    EXPECT_EQ(none.xml, "");
    EXPECT_EQ(none.context, first.context);
    const Piece last = pulled(first.context, 100);
    EXPECT_EQ(last.xml, "<d><e><f>");
    EXPECT_EQ(last.context, "");
    EXPECT_EQ(enumerations.size(), 0U);
    EXPECT_EQ(status([&] { pulled(first.context, 1); }), 21U);
}

TEST_F(OpenEnumerationsTest, AContextIs128BitsThatNeverRepeat) {
    std::set<std::string> contexts;
    for (int round = 0; round < 200; ++round) {
        const std::string context = opened(1).context;
        EXPECT_THAT(context, ::testing::MatchesRegex("[0-9a-f]{32}"));
        EXPECT_TRUE(contexts.insert(context).second);
        enumerations.close(context, anna);
    }
}

TEST_F(OpenEnumerationsTest, OnlyItsOwnerReachesAnEnumeration) {
    const std::string context = opened(3).context;
    const EnumerationOwner others[] = {
        {"berta", "root/cimv2"}, {std::nullopt, "root/cimv2"}, {"anna", "root/interop"}};
    for (const EnumerationOwner& other : others) {
        EXPECT_EQ(status([&] { enumerations.pull(context, other, PulledKind::InstancePaths, 1); }),
                  21U);
        EXPECT_EQ(status([&] { enumerations.close(context, other); }), 21U);
    }
    for (const PulledKind kind : {PulledKind::Instances, PulledKind::InstancesWithPath})
        EXPECT_EQ(status([&] { enumerations.pull(context, anna, kind, 1); }), 21U);
    for (const char* const wrong : {"", "0", "00000000000000000000000000000000"})
        EXPECT_EQ(status([&] { pulled(wrong, 1); }), 21U);
    EXPECT_EQ(pulled(context, 3).xml, "<a><b><c>");
}

TEST_F(OpenEnumerationsTest, AClosedOneIsGone) {
    const std::string context = opened(3).context;
    enumerations.close(context, anna);
    EXPECT_EQ(enumerations.size(), 0U);
    EXPECT_EQ(status([&] { enumerations.close(context, anna); }), 21U);
    EXPECT_EQ(status([&] { pulled(context, 1); }), 21U);
}

TEST_F(OpenEnumerationsTest, EndsWhenNobodyAskedForItUntilItsTimeOut) {
    const std::string brief = opened(3, 0, seconds(5)).context;
    const std::string longer = opened(3, 0, seconds(90)).context;
    now += seconds(4);
    EXPECT_EQ(pulled(brief, 1).xml, "<a>");
    // A stranger's question does not prolong it.
    now += seconds(4);
    EXPECT_EQ(status([&] { enumerations.close(brief, {}); }), 21U);
    EXPECT_EQ(enumerations.size(), 2U);
    now += seconds(1);
    EXPECT_EQ(status([&] { pulled(brief, 1); }), 21U);
    EXPECT_EQ(enumerations.size(), 1U);
    EXPECT_EQ(pulled(longer, 1).xml, "<a>");
}

TEST_F(OpenEnumerationsTest, MoreThan64AreRefusedUntilOneEnds) {
    std::vector<std::string> contexts;
    for (std::size_t index = 0; index < 64; ++index) contexts.push_back(opened(2).context);
    EXPECT_EQ(status([&] { opened(2); }), 27U);
    // One that need not wait takes no place.
    EXPECT_EQ(opened(2, 2).xml, "<a><b>");
    enumerations.close(contexts.front(), anna);
    EXPECT_EQ(status([&] { opened(2); }), 0U);
    EXPECT_EQ(status([&] { opened(2); }), 27U);
    now += seconds(30);
    EXPECT_EQ(status([&] { opened(2); }), 0U);
    EXPECT_EQ(enumerations.size(), 1U);
}

TEST_F(OpenEnumerationsTest, ResultsThatTakeTooMuchMemoryAreRefused) {
    const auto big = [&] {
        WrittenResults results;
        results.xml.assign(5 * 1024 * 1024, 'x');
        results.ends = {1, results.xml.size()};
        return enumerations.open(anna, PulledKind::InstancePaths, std::move(results), 1,
                                 seconds(30));
    };
    const std::string first = big().context;
    EXPECT_EQ(status(big), 0U);
    EXPECT_EQ(status(big), 0U);
    EXPECT_EQ(status(big), 27U);
    EXPECT_EQ(pulled(first, 1).xml.size(), 5 * 1024 * 1024 - 1U);
    EXPECT_EQ(status(big), 0U);
}

TEST_F(OpenEnumerationsTest, EightThreadsShareOutOneEnumeration) {
    const std::string context = opened(1000).context;
    std::atomic<std::size_t> bytes = 0;
    std::atomic<unsigned> ends = 0;
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 8; ++thread) {
        threads.emplace_back([&] {
            for (int round = 0; round < 1001; ++round) {
                try {
                    const Piece piece = pulled(context, 3);
                    bytes += piece.xml.size();
                    if (piece.context.empty()) ++ends;
                } catch (const CimError& error) {
                    EXPECT_EQ(error.code(), 21U);
                    return;
                }
            }
        });
    }
    for (std::thread& thread : threads) thread.join();
    EXPECT_EQ(bytes, 3000U);
    EXPECT_EQ(ends, 1U);
}

TEST_F(OpenEnumerationsTest, EightThreadsOpenPullAndCloseTheirOwn) {
    std::vector<std::thread> threads;
    for (unsigned number = 0; number < 8; ++number) {
        threads.emplace_back([&, number] {
            const EnumerationOwner owner{std::to_string(number), "root/cimv2"};
            for (int round = 0; round < 200; ++round) {
                const Piece first =
                    enumerations.open(owner, PulledKind::Instances, letters(4), 1, seconds(30));
                const Piece second =
                    enumerations.pull(first.context, owner, PulledKind::Instances, 1);
                EXPECT_EQ(first.xml + second.xml, "<a><b>");
                enumerations.close(first.context, owner);
            }
        });
    }
    for (std::thread& thread : threads) thread.join();
    EXPECT_EQ(enumerations.size(), 0U);
}

}  // namespace
}  // namespace cmpihost::server
