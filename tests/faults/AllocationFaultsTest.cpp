// std::bad_alloc from the n-th allocation that the provider and the framework's libraries make for
// a request, n counted up until the request succeeds.
#include <new>

#include "faults/Allocations.h"
#include "faults/FaultFixture.h"
#include "framework/instrumentation/HostSource.h"
#include "instrumentation/FixtureTree.h"

namespace {

using namespace cmpihost;
using Texts = std::vector<std::string>;

constexpr std::size_t mostAllocations = 5000;  ///< no request makes so many

// Shells of ended objects are blocks too: here none are kept.
BrokerOptions withoutQuarantine() {
    BrokerOptions options;
    options.quarantine = 0;
    return options;
}

struct Trial {
    std::size_t failed = 0;
    bool left = false;  ///< the exception left the handler
    Answer answer;
};

class AllocationFaults : public FaultsOfHandler {
  protected:
    AllocationFaults() : FaultsOfHandler(withoutQuarantine()) {}
    ~AllocationFaults() override { allocations::release(); }

    Trial failFrom(std::size_t n, bool andLater) {
        Trial trial;
        recording::clear();
        allocations::failFrom(n, andLater);
        try {
            trial.answer = answerTo(asked);
        } catch (const std::bad_alloc&) {
            trial.left = true;
        }
        trial.failed = allocations::release();
        if (trial.left) trial.answer.records = recording::take();
        broker.takeViolations();
        return trial;
    }

    void expectDue(const Trial& trial) const {
        ASSERT_FALSE(trial.left);
        expectSound(asked, trial.answer);
        EXPECT_EQ(trial.answer.outcome.rc, CMPI_RC_OK);
        EXPECT_EQ(trial.answer.messages, Texts{"std::bad_alloc"});
        EXPECT_EQ(trial.answer.outcome.doneCount, 0U);
        EXPECT_TRUE(isPrefix(trial.answer.elements, reference.elements));
    }

    void countUp(bool andLater) {
        std::size_t before = 0;
        std::size_t failures = 0;
        for (std::size_t n = 1;; ++n) {
            ASSERT_LT(n, mostAllocations);
            SCOPED_TRACE(testing::Message() << "allocation " << n);
            const std::size_t failed = tryOnce(n, andLater);
            // The first failure may have made the log keep one buffer more.
            const std::size_t after = allocations::blocksInUse();
            if (n > 1) {
                EXPECT_EQ(after, before);
            }
            before = after;
            if (failed == 0) break;
            ++failures;
        }
        // An adapter holds a cursor at least, and its parameter list.
        EXPECT_GE(failures, 2U);
    }

  private:
    std::size_t tryOnce(std::size_t n, bool andLater) {
        const Trial trial = failFrom(n, andLater);
        if (trial.failed == 0)
            expectSame(reference, trial.answer);
        else
            expectDue(trial);
        return trial.failed;
    }
};

TEST_P(AllocationFaults, OfTheNthAloneAreReportedAndLeaveNothingBehind) {
    forEachRequest([this] { countUp(false); });
}

TEST_P(AllocationFaults, OfAllFromTheNthOnAreReportedAndLeaveNothingBehind) {
    forEachRequest([this] { countUp(true); });
}

TEST_P(AllocationFaults, OnALinuxHostAreReportedAndLeaveNothingBehind) {
    FixtureTree tree;
    tree.writeCompleteHost();
    // However long the test takes, a request leaves nothing for the next.
    for (const char* name : {"etc/os-release", "run/systemd/sessions"}) tree.dateAhead(name);
    VA::setHostSource(VA::makeLinuxHost(tree.root()));
    forEachRequest([this] { countUp(false); });
}

INSTANTIATE_TEST_SUITE_P(Of, AllocationFaults, testing::ValuesIn(servingHandlers()), nameOf);

/// A provider that was loaded a moment ago: its log has no buffers yet.
class JustLoaded : public FaultFixture {
  public:
    JustLoaded() : FaultFixture(withoutQuarantine()) {}
    void TestBody() override {}

    // False when no allocation failed.
    bool serve(const NamedRequest& asked, std::size_t n, bool andLater) {
        bool left = false;
        Answer answer;
        allocations::failFrom(n, andLater);
        try {
            answer = answerTo(asked);
        } catch (const std::bad_alloc&) {
            left = true;
        }
        const bool failed = allocations::release() != 0;
        if (left) answer.records = recording::take();
        broker.takeViolations();
        const std::string records = recordsOf(answer);
        // Outside the walk it leaves the handler, with neither a message nor the last marker.
        EXPECT_EQ(left, records.find("markProviderExit") == std::string::npos);
        EXPECT_EQ(answer.messages, failed && !left ? Texts{"std::bad_alloc"} : Texts{});
        if (!left) expectSound(asked, answer);
        return failed;
    }
};

TEST(AllocationFaultsAfterLoading, AreReportedOrLeaveTheHandlerAndLeaveNothingBehind) {
    for (const char* handler : {"OperatingSystem_EnumInstances", "OperatingSystem_GetInstance"}) {
        NamedRequest asked = {"", handler, {}, ""};
        asked.request.path = operatingSystemPath("host1", "Linux");
        if (handler == std::string("OperatingSystem_GetInstance"))
            asked.request.operation = Operation::GetInstance;
        for (const bool andLater : {false, true}) {
            std::size_t before = 0;
            for (std::size_t n = 1;; ++n) {
                ASSERT_LT(n, mostAllocations);
                SCOPED_TRACE(testing::Message() << handler << ", allocation " << n);
                const bool failed = std::make_unique<JustLoaded>()->serve(asked, n, andLater);
                recording::clear();
                if (n > 1) {
                    EXPECT_EQ(allocations::blocksInUse(), before);
                }
                before = allocations::blocksInUse();
                if (!failed) break;
            }
        }
    }
}

}  // namespace
