// std::bad_alloc from the n-th allocation that the provider and the framework's libraries make for
// a request, n counted up until the request succeeds.
#include "faults/Allocations.h"
#include "faults/FaultFixture.h"
#include "framework/instrumentation/HostSource.h"
#include "support/FixtureTree.h"

namespace {

using namespace cmpihost;
using Texts = std::vector<std::string>;

class AllocationFaults : public FaultsOfHandler {
  protected:
    AllocationFaults() : FaultsOfHandler(withoutQuarantine) {}
    ~AllocationFaults() override { allocations::release(); }

    void expectDue(const Attempt& attempt) const {
        ASSERT_EQ(attempt.end, Attempt::Answered);
        expectSound(asked, attempt.answer);
        EXPECT_EQ(attempt.answer.outcome.rc, CMPI_RC_OK);
        EXPECT_EQ(attempt.answer.messages, Texts{"std::bad_alloc"});
        EXPECT_EQ(attempt.answer.outcome.doneCount, 0U);
        EXPECT_TRUE(isPrefix(attempt.answer.elements, reference.elements));
    }

    void countUpForEachRequest(bool andLater) {
        forEachRequest([&] {
            const std::size_t end = countAllocationsUp([&](std::size_t n) {
                allocations::failFrom(n, andLater);
                const Attempt attempt = this->attempt(asked);
                const bool failed = allocations::release() != 0;
                if (failed)
                    expectDue(attempt);
                else
                    expectSame(reference, attempt.answer);
                return failed;
            });
            // An adapter holds a cursor at least, and its parameter list.
            EXPECT_GT(end, 2U);
        });
    }
};

TEST_P(AllocationFaults, OfTheNthAloneAreReportedAndLeaveNothingBehind) {
    countUpForEachRequest(false);
}

TEST_P(AllocationFaults, OfAllFromTheNthOnAreReportedAndLeaveNothingBehind) {
    countUpForEachRequest(true);
}

TEST_P(AllocationFaults, OnALinuxHostAreReportedAndLeaveNothingBehind) {
    FixtureTree tree;
    tree.writeCompleteHost();
    // However long the test takes, a request leaves nothing for the next.
    for (const char* name : {"etc/os-release", "run/systemd/sessions"}) tree.dateAhead(name);
    VA::setHostSource(VA::makeLinuxHost(tree.root()));
    countUpForEachRequest(false);
}

INSTANTIATE_TEST_SUITE_P(Of, AllocationFaults, testing::ValuesIn(servingHandlers()), nameOf);

/// A provider that was loaded a moment ago: its log has no buffers yet.
class JustLoaded : public FaultFixture {
  public:
    JustLoaded() : FaultFixture(withoutQuarantine) {}
    void TestBody() override {}

    // False when no allocation failed.
    bool serve(const NamedRequest& asked, std::size_t n, bool andLater) {
        recording::clear();
        allocations::failFrom(n, andLater);
        const Attempt attempt = this->attempt(asked);
        const bool failed = allocations::release() != 0;
        const bool left = attempt.end != Attempt::Answered;
        // Outside the walk it leaves the handler, with neither a message nor the last marker.
        EXPECT_EQ(left, recordsOf(attempt.answer).find("markProviderExit") == std::string::npos);
        EXPECT_EQ(attempt.answer.messages, failed && !left ? Texts{"std::bad_alloc"} : Texts{});
        if (!left) expectSound(asked, attempt.answer);
        return failed;
    }
};

TEST(AllocationFaultsAfterLoading, AreReportedOrLeaveTheHandlerAndLeaveNothingBehind) {
    for (const char* handler : {"OperatingSystem_EnumInstances", "OperatingSystem_GetInstance"}) {
        SCOPED_TRACE(handler);
        const NamedRequest asked = requestsOf(handler).front();
        for (const bool andLater : {false, true})
            countAllocationsUp([&](std::size_t n) {
                const bool failed = std::make_unique<JustLoaded>()->serve(asked, n, andLater);
                recording::clear();
                return failed;
            });
    }
}

}  // namespace
