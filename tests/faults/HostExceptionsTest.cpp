// Exceptions of every kind from the n-th call of the instrumentation and from the n-th record, n
// counted up until none is thrown any more.

#include <iterator>

#include "faults/ExceptionKinds.h"
#include "faults/FaultFixture.h"

namespace {

using namespace cmpihost;
using Texts = std::vector<std::string>;

/// How a request ended, and whether it met what was thrown.
struct Trial {
    bool thrown = false;
    Attempt::End end = Attempt::Answered;
    Answer answer;
};

class ExceptionFaults : public FaultsOfHandler {
  protected:
    ~ExceptionFaults() override { host->setHook({}); }

    Trial throwFromHost(const ExceptionKind& kind, std::size_t n) {
        Trial trial;
        std::size_t calls = 0;
        host->setHook([&](const VA::SimulatedHost::Call&) {
            trial.thrown = ++calls == n || trial.thrown;
            if (calls == n) kind.raise();
        });
        run(trial);
        return trial;
    }

    Trial throwFromLog(const ExceptionKind& kind, std::size_t n) {
        Trial trial;
        std::size_t calls = 0;
        recording::setHook([&](const recording::Record&) {
            trial.thrown = ++calls == n || trial.thrown;
            if (calls == n) kind.raise();
        });
        run(trial);
        return trial;
    }

    static Attempt::End endOf(const ExceptionKind& kind) {
        return kind.text == nullptr ? Attempt::Foreign : Attempt::Standard;
    }

    // The exception left the handler, with neither a message nor the marker of the end.
    static void expectLeft(const Trial& trial, const ExceptionKind& kind) {
        EXPECT_EQ(trial.end, endOf(kind));
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
            EXPECT_EQ(trial.end, endOf(kind));
        } else if (kind.text == nullptr || n <= 6) {
            expectLeft(trial, kind);
        } else {
            ASSERT_EQ(trial.end, Attempt::Answered);
            EXPECT_EQ(trial.answer.messages, Texts{kind.text});
            EXPECT_TRUE(isPrefix(trial.answer.elements, reference.elements));
            const bool ended = reference.records[n - 1].function[0] == '~';
            EXPECT_EQ(trial.answer.outcome.doneCount, ended ? 1U : 0U);
        }
    }

    void expectReported(const Trial& trial, const ExceptionKind& kind) const {
        ASSERT_EQ(trial.end, Attempt::Answered);
        expectSound(asked, trial.answer);
        EXPECT_EQ(trial.answer.outcome.rc, CMPI_RC_OK);
        EXPECT_EQ(trial.answer.messages, Texts{kind.text});
        EXPECT_EQ(trial.answer.outcome.doneCount, 0U);
        EXPECT_TRUE(isPrefix(trial.answer.elements, reference.elements));
    }

  private:
    void run(Trial& trial) {
        const Attempt attempt = this->attempt(asked);
        trial.end = attempt.end;
        trial.answer = attempt.answer;
        host->setHook({});
        limitRecords();
    }
};

TEST_P(ExceptionFaults, FromTheNthCallOfTheHostAreReportedOrLeaveByTheirType) {
    forEachRequest([this] {
        for (const ExceptionKind& kind : exceptionKinds) {
            SCOPED_TRACE(kind.name);
            countUp("host call", [&](std::size_t n) {
                const Trial trial = throwFromHost(kind, n);
                if (trial.thrown && kind.text == nullptr) expectLeft(trial, kind);
                if (trial.thrown && kind.text != nullptr) expectReported(trial, kind);
                return trial.thrown;
            });
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
        const std::size_t end = countUp("record", [&](std::size_t n) {
            const ExceptionKind& kind = exceptionKinds[(n + turn) % std::size(exceptionKinds)];
            SCOPED_TRACE(kind.name);
            const Trial trial = throwFromLog(kind, n);
            if (trial.thrown && !meetsAnother(n)) expectDue(trial, kind, n);
            return trial.thrown;
        });
        EXPECT_EQ(end, reference.records.size() + 1);
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
                EXPECT_EQ(trial.end, message ? endOf(kind) : Attempt::Answered);
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
