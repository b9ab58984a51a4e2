// Exceptions of every kind from the n-th function of the framework that is entered for a request, n
// counted up until the request succeeds: object paths, instances, monikers and message buffers. The
// compiler's instrumentation reaches every function, whatever is added to the framework.
#include <utility>

#include "faults/ExceptionKinds.h"
#include "faults/FaultFixture.h"

namespace {

/// What the next function but `callsLeft` is to throw; null: nothing any more.
void (*raiseNow)() = nullptr;
std::size_t callsLeft = 0;

}  // namespace

// What the compiler calls on entering and on leaving a function.
extern "C" {

void __cyg_profile_func_enter(void* function, void* caller);
void __cyg_profile_func_exit(void* function, void* caller);

void __cyg_profile_func_enter(void*, void*) {
    if (raiseNow != nullptr && --callsLeft == 0) std::exchange(raiseNow, nullptr)();
}

void __cyg_profile_func_exit(void*, void*) {}
}

namespace {

class FrameworkCallFaults : public FaultsOfHandler {
  protected:
    ~FrameworkCallFaults() override { raiseNow = nullptr; }

    // False when nothing was thrown any more.
    bool throwFrom(std::size_t n, const ExceptionKind& kind) {
        recording::clear();
        callsLeft = n;
        raiseNow = kind.raise;
        const Attempt attempt = this->attempt(asked);
        const Answer& answer = attempt.answer;
        if (std::exchange(raiseNow, nullptr) != nullptr) return false;

        const std::string records = recordsOf(answer);
        if (attempt.end != Attempt::Answered) {
            EXPECT_EQ(attempt.end, kind.text == nullptr ? Attempt::Foreign : Attempt::Standard);
            EXPECT_EQ(records.find("MESSAGE "), std::string::npos);
            // Before the walk are six records, and four after it.
            const std::size_t written = answer.records.size();
            EXPECT_TRUE(kind.text == nullptr || written < 6 ||
                        written >= reference.records.size() - 4)
                << written;
        } else {
            EXPECT_NE(kind.text, nullptr);
            EXPECT_EQ(answer.outcome.rc, CMPI_RC_OK);
            EXPECT_EQ(answer.messages, std::vector<std::string>{kind.text ? kind.text : ""});
            EXPECT_LE(answer.outcome.doneCount, 1U);
            EXPECT_TRUE(isPrefix(answer.elements, reference.elements));
            EXPECT_NE(records.find("markProviderExit"), std::string::npos);
        }
        return true;
    }
};

TEST_P(FrameworkCallFaults, AreReportedOrLeaveByTypeAndTheNextRequestIsRight) {
    forEachRequest([&] {
        // Exceptions that meet one that is under way are a matter of the records alone.
        if (!reference.messages.empty()) return;
        for (const ExceptionKind& kind : exceptionKinds) {
            SCOPED_TRACE(kind.name);
            EXPECT_GT(countUp("call", [&](std::size_t n) { return throwFrom(n, kind); }), 50U);
            expectSame(reference, answerTo(asked));
            broker.takeViolations();
        }
    });
}

INSTANTIATE_TEST_SUITE_P(Of, FrameworkCallFaults, testing::ValuesIn(servingHandlers()), nameOf);

}  // namespace
