// Exceptions of every kind from the n-th function of the framework that is entered for a request, n
// counted up until the request succeeds: object paths, instances, monikers and message buffers.
#include <algorithm>
#include <string>
#include <tuple>

#include "faults/ExceptionKinds.h"
#include "faults/FaultFixture.h"
#include "faults/FrameworkCalls.h"

namespace {

using namespace cmpihost;
using Texts = std::vector<std::string>;

using HandlerAndKind = std::tuple<std::string, ExceptionKind>;

bool hasMessage(const Answer& answer) {
    return std::any_of(answer.records.begin(), answer.records.end(), [](const auto& record) {
        return record.text.compare(0, 8, "MESSAGE ") == 0;
    });
}

bool hasExitMarker(const Answer& answer) {
    return std::any_of(answer.records.begin(), answer.records.end(),
                       [](const auto& record) { return record.function == "markProviderExit"; });
}

class FrameworkCallFaults : public EachRequestFixture,
                            public testing::WithParamInterface<HandlerAndKind> {
  protected:
    ~FrameworkCallFaults() override { frameworkCalls::release(); }

    // False when nothing was thrown any more.
    bool throwFrom(std::size_t n, const ExceptionKind& kind) {
        recording::clear();
        frameworkCalls::throwFrom(n, kind.raise);
        const Attempt attempt = this->attempt(asked);
        const bool met = frameworkCalls::release();
        const Answer& answer = attempt.answer;
        if (!met) return false;

        if (kind.text == nullptr) {
            EXPECT_EQ(attempt.end, Attempt::Foreign);
            EXPECT_FALSE(hasMessage(answer));
        } else if (attempt.end == Attempt::Standard) {
            expectOutsideTheWalk(answer);
        } else {
            EXPECT_EQ(attempt.end, Attempt::Answered);
            EXPECT_EQ(answer.outcome.rc, CMPI_RC_OK);
            EXPECT_EQ(answer.messages, Texts{kind.text});
            EXPECT_LE(answer.outcome.doneCount, 1U);
            EXPECT_TRUE(isPrefix(answer.elements, reference.elements));
            EXPECT_TRUE(hasExitMarker(answer));
        }
        return true;
    }

    // Before the walk are six records, and four after it.
    void expectOutsideTheWalk(const Answer& answer) const {
        const std::size_t written = answer.records.size();
        EXPECT_TRUE(written < 6 || written >= reference.records.size() - 4) << written;
        EXPECT_FALSE(hasMessage(answer));
    }
};

TEST_P(FrameworkCallFaults, AreReportedOrLeaveByTypeAndTheNextRequestIsRight) {
    const auto& [handler, thrown] = GetParam();
    const ExceptionKind& kind = thrown;
    forEachRequestOf(handler, [&] {
        // Exceptions that meet one that is under way are a matter of the records alone.
        if (!reference.messages.empty()) return;
        EXPECT_GT(countUp("call", [&](std::size_t n) { return throwFrom(n, kind); }), 50U);
    });
}

std::string nameOfBoth(const testing::TestParamInfo<HandlerAndKind>& info) {
    const auto& [handler, kind] = info.param;
    return shortNameOf(handler) + '_' + kind.name;
}

INSTANTIATE_TEST_SUITE_P(Of, FrameworkCallFaults,
                         testing::Combine(testing::ValuesIn(servingHandlers()),
                                          testing::ValuesIn(exceptionKinds)),
                         nameOfBoth);

}  // namespace
