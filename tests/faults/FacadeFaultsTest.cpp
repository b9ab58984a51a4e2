// The facade under faults that are counted up: its answers are whole, or none. The provider behind
// it swallows some of what fails within it; what it then says is all that the facade knows.
#include <algorithm>
#include <iterator>

#include "faults/Allocations.h"
#include "faults/ExceptionKinds.h"
#include "faults/FaultFixture.h"

namespace {

using namespace cmpihost;
using Texts = std::vector<std::string>;

constexpr std::size_t mostTrials = 20000;  ///< no request has so many calls or allocations

BrokerOptions withoutQuarantine() {
    BrokerOptions options;
    options.quarantine = 0;
    return options;
}

LoadOptions byName() {
    LoadOptions options;
    options.providerName = "OSStatusFacade";
    return options;
}

class FacadeFaults : public FaultsOfHandler {
  protected:
    FacadeFaults()
        : FaultsOfHandler(withoutQuarantine()),
          facade(KORVA_BINARY_DIR "/lib/libkorvaosstatusfacade.so.1", broker, byName()) {
        answering = &facade;
    }
    ~FacadeFaults() override {
        allocations::release();
        host->setHook({});
    }

    template <class Body>
    void forEachRequest(Body body) {
        FaultsOfHandler::forEachRequest([&] {
            wholeAnswers = answersThatCountAsWhole();
            body();
            broker.takeViolations();
        });
    }

    // OK with a whole answer, or refused with none.
    void expectWholeOrRefused(const Answer& answer) const {
        if (answer.outcome.rc == CMPI_RC_OK) {
            EXPECT_EQ(answer.outcome.doneCount, 1U);
            EXPECT_TRUE(contains(wholeAnswers, answer.elements))
                << testing::PrintToString(answer.elements);
        } else {
            expectRefused(answer);
        }
    }

    // As due, or because something failed, or because the provider broke off where it tells of a
    // pair that there is none.
    void expectRefused(const Answer& answer) const {
        EXPECT_EQ(answer.outcome.doneCount, 0U);
        EXPECT_TRUE(answer.elements.empty());
        const CMPIrc rc = answer.outcome.rc;
        const bool notFound = rc == CMPI_RC_ERR_NOT_FOUND &&
                              asked.request.operation == Operation::GetInstance &&
                              contains(associations, asked.request.path.className);
        EXPECT_TRUE(rc == CMPI_RC_ERR_FAILED || rc == reference.outcome.rc || notFound) << rc;
    }

    template <class Value>
    static bool contains(const std::vector<Value>& all, const Value& value) {
        return std::find(all.begin(), all.end(), value) != all.end();
    }

    ProviderLibrary facade;
    std::vector<Texts> wholeAnswers;

  private:
    // The reference, and what is left of it without one or more of the associations: a provider
    // that breaks off before the first pair of one says that there is none.
    std::vector<Texts> answersThatCountAsWhole() {
        std::vector<Texts> answers = {reference.elements};
        const std::vector<Texts> parts = partsOfReference();
        for (unsigned chosen = 0; chosen < 1U << parts.size(); ++chosen) {
            Texts answer;
            for (std::size_t part = 0; part < parts.size(); ++part)
                for (const std::string& element : parts[part])
                    if ((chosen >> part & 1U) != 0 && !contains(answer, element))
                        answer.push_back(element);
            answers.push_back(answer);
        }
        if (parts.empty()) answers.resize(1);
        return answers;
    }

    // What each association gives for the request.
    std::vector<Texts> partsOfReference() {
        OperationRequest& request = asked.request;
        const OperationRequest whole = request;
        std::optional<std::string>* association = nullptr;
        if (isAnyOf({Operation::AssociatorNames, Operation::Associators}))
            association = &request.assocClass;
        if (isAnyOf({Operation::ReferenceNames, Operation::References}))
            association = &request.resultClass;
        const bool ofPairs =
            isAnyOf({Operation::EnumerateInstanceNames, Operation::EnumerateInstances}) &&
            contains(associations, request.path.className);
        std::vector<Texts> parts;
        if (ofPairs || (association != nullptr && *association)) return {reference.elements};
        if (association == nullptr) return {};
        for (const std::string& each : associations) {
            *association = each;
            parts.push_back(answerTo(asked).elements);
        }
        request = whole;
        return parts;
    }

    bool isAnyOf(const std::vector<Operation>& operations) const {
        return contains(operations, asked.request.operation);
    }

    const Texts associations = {"KORVA_InstalledOS", "KORVA_RunningOS",
                                "KORVA_OSElementCapabilities"};
};

/// One fault of the broker and what came of it.
struct Trial {
    FaultPlan plan;
    Answer answer;
    bool ofProvider = false;  ///< a call of the provider failed, not one of the facade
};

class FacadeBrokerFaults : public FacadeFaults {
  protected:
    // False when no call failed. The provider's markers tell whose call it was.
    bool run(Trial& trial, unsigned n, unsigned times, CMPIrc rc) {
        trial.plan.add({"", n, times, rc});
        bool inProvider = false;
        recording::setHook([&](const recording::Record& record) {
            if (record.function != "markProviderEntry" && record.function != "markProviderExit")
                return;
            if (inProvider && trial.plan.calls() >= n && !passed) trial.ofProvider = true;
            if (trial.plan.calls() >= n) passed = true;
            inProvider = record.function == "markProviderEntry";
        });
        passed = false;
        broker.setFaultPlan(&trial.plan);
        trial.answer = answerTo(asked);
        broker.setFaultPlan(nullptr);
        limitRecords();
        return trial.plan.fired() != 0;
    }

    // What holds even where the provider swallowed the fault, or where the broker's nothing looked
    // like a true one.
    void expectEnded(const Trial& trial) {
        const bool served = trial.answer.outcome.rc == CMPI_RC_OK;
        EXPECT_EQ(trial.plan.calls("CMPIResultFT.returnDone"), served ? 1U : 0U);
        if (!served) {
            EXPECT_TRUE(trial.answer.elements.empty());
        }
        // The result notes a path that lacks a key; nothing else may be wrong.
        for (const std::string& violation : broker.takeViolations())
            EXPECT_NE(violation.find(" without key "), std::string::npos) << violation;
    }

    bool passed = false;
};

TEST_P(FacadeBrokerFaults, OfTheNthCallGiveAWholeAnswerOrARefusal) {
    forEachRequest([this] {
        for (unsigned n = 1;; ++n) {
            ASSERT_LT(n, mostTrials);
            Trial trial;
            if (!run(trial, n, 1, CMPI_RC_ERR_FAILED)) break;
            const std::string entry = trial.plan.firedCalls().front();
            SCOPED_TRACE(testing::Message() << "call " << n << ", " << entry);
            expectEnded(trial);
            // What the client's result says is ignored.
            if (!trial.ofProvider && entry.rfind("CMPIResultFT.", 0) != 0)
                expectWholeOrRefused(trial.answer);
        }
    });
}

TEST_P(FacadeBrokerFaults, OfEveryCallFromTheNthOnAndNullsThatPassForSuccessLetTheRequestEnd) {
    forEachRequest([this] {
        for (const CMPIrc rc : {CMPI_RC_ERR_FAILED, CMPI_RC_OK})
            for (const unsigned times : {0U, 1U})
                for (unsigned n = 1;; ++n) {
                    ASSERT_LT(n, mostTrials);
                    Trial trial;
                    if (!run(trial, n, times, rc)) break;
                    SCOPED_TRACE(testing::Message() << "call " << n << ", rc " << rc);
                    expectEnded(trial);
                }
    });
}

TEST_P(FacadeFaults, OfTheNthCallOfTheHostGiveAWholeAnswerOrARefusal) {
    std::size_t turn = 0;
    forEachRequest([&] {
        ++turn;
        for (std::size_t n = 1;; ++n) {
            ASSERT_LT(n, mostTrials);
            const ExceptionKind& kind = exceptionKinds[(n + turn) % std::size(exceptionKinds)];
            SCOPED_TRACE(testing::Message() << kind.name << " from call " << n);
            std::size_t calls = 0;
            host->setHook([&](const VA::SimulatedHost::Call&) {
                if (++calls == n) kind.raise();
            });
            const Answer answer = answerTo(asked);
            host->setHook({});
            expectWholeOrRefused(answer);
            if (calls < n) break;
        }
    });
}

TEST_P(FacadeFaults, OfTheNthRecordGiveAWholeAnswerOrARefusal) {
    std::size_t turn = 0;
    forEachRequest([&] {
        ++turn;
        for (std::size_t n = 1;; ++n) {
            ASSERT_LT(n, mostTrials);
            const ExceptionKind& kind = exceptionKinds[(n + turn) % std::size(exceptionKinds)];
            SCOPED_TRACE(testing::Message() << kind.name << " from record " << n);
            std::size_t records = 0;
            recording::setHook([&](const recording::Record&) {
                if (++records == n) kind.raise();
            });
            const Answer answer = answerTo(asked);
            limitRecords();
            expectWholeOrRefused(answer);
            if (records < n) break;
        }
    });
}

class FacadeAllocationFaults : public FacadeFaults {
  protected:
    // How many allocations failed.
    std::size_t tryOnce(std::size_t n, bool andLater) {
        allocations::failFrom(n, andLater);
        const Answer answer = answerTo(asked);
        const std::size_t failed = allocations::release();
        expectWholeOrRefused(answer);
        broker.takeViolations();
        return failed;
    }

    void countUp(bool andLater) {
        std::size_t before = 0;
        for (std::size_t n = 1;; ++n) {
            ASSERT_LT(n, mostTrials);
            SCOPED_TRACE(testing::Message() << "allocation " << n);
            const std::size_t failed = tryOnce(n, andLater);
            // The first failure may have made the log keep one buffer more.
            const std::size_t after = allocations::blocksInUse();
            if (n > 1) {
                EXPECT_EQ(after, before);
            }
            before = after;
            if (failed != 0) continue;
            EXPECT_GT(n, 1U);
            break;
        }
    }
};

TEST_P(FacadeAllocationFaults, OfTheNthAloneGiveAWholeAnswerOrARefusalAndLeaveNothingBehind) {
    forEachRequest([this] { countUp(false); });
}

TEST_P(FacadeAllocationFaults, OfAllFromTheNthOnGiveAWholeAnswerOrARefusalAndLeaveNothingBehind) {
    forEachRequest([this] { countUp(true); });
}

INSTANTIATE_TEST_SUITE_P(Of, FacadeFaults, testing::ValuesIn(facadeHandlers()), nameOf);
INSTANTIATE_TEST_SUITE_P(Of, FacadeBrokerFaults, testing::ValuesIn(facadeHandlers()), nameOf);
INSTANTIATE_TEST_SUITE_P(Of, FacadeAllocationFaults, testing::ValuesIn(facadeHandlers()), nameOf);

}  // namespace
