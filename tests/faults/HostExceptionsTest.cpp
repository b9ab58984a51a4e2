// Exceptions of every kind from the n-th call of the instrumentation and from the n-th record, n
// counted up until none is thrown any more.

#include <exception>
#include <iterator>

#include "faults/ExceptionKinds.h"
#include "faults/FaultFixture.h"

namespace {

using namespace cmpihost;
using Texts = std::vector<std::string>;

constexpr std::size_t mostCalls = 2000;  ///< no request makes so many

/// An answer, or none where an exception left the handler.
struct Trial {
    bool thrown = false;   ///< the fault was met
    bool foreign = false;  ///< what left the handler is of a foreign type
    bool standard = false;
    Answer answer;
};

class ExceptionFaults : public FaultsOfHandler {
  protected:
    ~ExceptionFaults() override { host->setHook({}); }

    void run(Trial& trial) {
        try {
            trial.answer = answerTo(asked);
        } catch (const std::exception&) {
            trial.standard = true;
        } catch (...) {
            trial.foreign = true;
        }
        if (trial.standard || trial.foreign) trial.answer.records = recording::take();
        host->setHook({});
        limitRecords();
        broker.takeViolations();
    }

    Trial throwFromHost(const ExceptionKind& kind, std::size_t n) {
        Trial trial;
        std::size_t calls = 0;
        host->setHook([&](const VA::SimulatedHost::Call&) {
            if (++calls != n) return;
            trial.thrown = true;
            kind.raise();
        });
        run(trial);
        return trial;
    }

    Trial throwFromLog(const ExceptionKind& kind, std::size_t n) {
        Trial trial;
        std::size_t calls = 0;
        recording::setHook([&](const recording::Record&) {
            if (++calls != n) return;
            trial.thrown = true;
            kind.raise();
        });
        run(trial);
        return trial;
    }

    // The exception left the handler, with neither a message nor the marker of the end.
    static void expectLeft(const Trial& trial, const ExceptionKind& kind) {
        EXPECT_EQ(trial.foreign, kind.text == nullptr);
        EXPECT_EQ(trial.standard, kind.text != nullptr);
        const std::string records = recordsOf(trial.answer);
        EXPECT_EQ(records.find("MESSAGE "), std::string::npos);
        EXPECT_EQ(records.find("markProviderExit"), std::string::npos);
    }

    // True for a record that the reference writes while an exception of its own is under way, and
    // for its message.
    bool meetsAnother(std::size_t n) const {
        const recording::Record& record = reference.records[n - 1];
        return !reference.messages.empty() && (record.function[0] == '~' || isMessage(record));
    }

    static bool isMessage(const recording::Record& record) {
        return record.text.rfind("MESSAGE ", 0) == 0;
    }

    // What is due for an exception from the n-th record: the first six and the last four, in both
    // channels, are written outside the walk, and those of destructors when it has ended.
    void expectDue(const Trial& trial, const ExceptionKind& kind, std::size_t n) const {
        if (n > reference.records.size() - 4) {
            EXPECT_EQ(trial.foreign, kind.text == nullptr);
            EXPECT_EQ(trial.standard, kind.text != nullptr);
        } else if (kind.text == nullptr || n <= 6) {
            expectLeft(trial, kind);
        } else {
            ASSERT_FALSE(trial.standard || trial.foreign);
            EXPECT_EQ(trial.answer.messages, Texts{kind.text});
            EXPECT_TRUE(isPrefix(trial.answer.elements, reference.elements));
            const bool ended = reference.records[n - 1].function[0] == '~';
            EXPECT_EQ(trial.answer.outcome.doneCount, ended ? 1U : 0U);
        }
    }

    void expectReported(const Trial& trial, const ExceptionKind& kind) const {
        ASSERT_FALSE(trial.standard || trial.foreign);
        expectSound(asked, trial.answer);
        EXPECT_EQ(trial.answer.outcome.rc, CMPI_RC_OK);
        EXPECT_EQ(trial.answer.messages, Texts{kind.text});
        EXPECT_TRUE(isPrefix(trial.answer.elements, reference.elements));
    }
};

TEST_P(ExceptionFaults, FromTheNthCallOfTheHostAreReportedOrLeaveByTheirType) {
    forEachRequest([this] {
        for (const ExceptionKind& kind : exceptionKinds) {
            for (std::size_t n = 1;; ++n) {
                ASSERT_LT(n, mostCalls);
                SCOPED_TRACE(testing::Message() << kind.name << " from call " << n);
                const Trial trial = throwFromHost(kind, n);
                if (!trial.thrown) break;
                if (kind.text == nullptr) {
                    expectLeft(trial, kind);
                } else {
                    expectReported(trial, kind);
                    EXPECT_EQ(trial.answer.outcome.doneCount, 0U);
                }
            }
            expectSame(reference, answerTo(asked));
            broker.takeViolations();
        }
    });
}

// Each record meets one of the kinds, in each request another one.
TEST_P(ExceptionFaults, FromTheNthRecordAreReportedWhereTheyMeetTheWalk) {
    std::size_t turn = 0;
    forEachRequest([&] {
        ++turn;
        for (std::size_t n = 1;; ++n) {
            ASSERT_LT(n, mostCalls);
            const ExceptionKind& kind = exceptionKinds[(n + turn) % std::size(exceptionKinds)];
            SCOPED_TRACE(testing::Message() << kind.name << " from record " << n);
            const Trial trial = throwFromLog(kind, n);
            if (!trial.thrown) {
                EXPECT_EQ(n, reference.records.size() + 1);
                break;
            }
            if (!meetsAnother(n)) expectDue(trial, kind, n);
        }
    });
}

// While the request's own exception is under way, destructors give up their records; the message of
// the exception is written outside the walk.
TEST_P(ExceptionFaults, FromRecordsDuringAnExceptionNeverReplaceIt) {
    forEachRequest([this] {
        if (reference.messages.empty()) return;
        for (const ExceptionKind& kind : exceptionKinds) {
            for (std::size_t n = 1; n <= reference.records.size(); ++n) {
                if (!meetsAnother(n)) continue;
                const bool message = isMessage(reference.records[n - 1]);
                SCOPED_TRACE(testing::Message() << kind.name << " from record " << n);
                const Trial trial = throwFromLog(kind, n);
                ASSERT_TRUE(trial.thrown);
                EXPECT_EQ(trial.foreign, message && kind.text == nullptr);
                EXPECT_EQ(trial.standard, message && kind.text != nullptr);
                if (!message) {
                    EXPECT_EQ(trial.answer.messages, reference.messages);
                }
            }
            expectSame(reference, answerTo(asked));
            broker.takeViolations();
        }
    });
}

INSTANTIATE_TEST_SUITE_P(Of, ExceptionFaults, testing::ValuesIn(servingHandlers()), nameOf);

}  // namespace
