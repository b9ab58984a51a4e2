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

class FacadeFaults : public FaultsOfHandler {
  protected:
    FacadeFaults()
        : FaultsOfHandler(withoutQuarantine),
          facade(KORVA_BINARY_DIR "/lib/libkorvaosstatusfacade.so.1", broker, {"OSStatusFacade"}) {
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

    // `arm` has each call of something do what it is given, until the next hooks are set.
    template <class Arm>
    void countExceptionsUp(Arm arm) {
        std::size_t turn = 0;
        forEachRequest([&] {
            ++turn;
            countUp("call", [&](std::size_t n) {
                const ExceptionKind& kind = exceptionKinds[(n + turn) % std::size(exceptionKinds)];
                SCOPED_TRACE(kind.name);
                std::size_t calls = 0;
                arm([&] {
                    if (++calls == n) kind.raise();
                });
                const Answer answer = answerTo(asked);
                host->setHook({});
                limitRecords();
                expectWholeOrRefused(answer);
                return calls >= n;
            });
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
    bool run(Trial& trial, std::size_t n, unsigned times, CMPIrc rc) {
        trial.plan.add({"", static_cast<unsigned>(n), times, rc});
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
        countUp("call", [this](std::size_t n) {
            Trial trial;
            if (!run(trial, n, 1, CMPI_RC_ERR_FAILED)) return false;
            const std::string entry = trial.plan.firedCalls().front();
            SCOPED_TRACE(entry);
            expectEnded(trial);
            // What the client's result says is ignored.
            if (!trial.ofProvider && entry.rfind("CMPIResultFT.", 0) != 0)
                expectWholeOrRefused(trial.answer);
            return true;
        });
    });
}

TEST_P(FacadeBrokerFaults, OfEveryCallFromTheNthOnAndNullsThatPassForSuccessLetTheRequestEnd) {
    forEachRequest([this] {
        for (const CMPIrc rc : {CMPI_RC_ERR_FAILED, CMPI_RC_OK})
            for (const unsigned times : {0U, 1U})
                countUp("call", [&](std::size_t n) {
                    Trial trial;
                    if (!run(trial, n, times, rc)) return false;
                    SCOPED_TRACE(testing::Message() << "rc " << rc);
                    expectEnded(trial);
                    return true;
                });
    });
}

// Each call meets one of the kinds, in each request another one.
TEST_P(FacadeFaults, OfTheNthCallOfTheHostGiveAWholeAnswerOrARefusal) {
    countExceptionsUp([this](auto raise) {
        host->setHook([raise](const VA::SimulatedHost::Call&) { raise(); });
    });
}

TEST_P(FacadeFaults, OfTheNthRecordGiveAWholeAnswerOrARefusal) {
    countExceptionsUp(
        [](auto raise) { recording::setHook([raise](const recording::Record&) { raise(); }); });
}

class FacadeAllocationFaults : public FacadeFaults {
  protected:
    void countUpForEachRequest(bool andLater) {
        forEachRequest([&] {
            const std::size_t end = countAllocationsUp([&](std::size_t n) {
                allocations::failFrom(n, andLater);
                const Answer answer = answerTo(asked);
                const bool failed = allocations::release() != 0;
                expectWholeOrRefused(answer);
                broker.takeViolations();
                return failed;
            });
            EXPECT_GT(end, 1U);
        });
    }
};

TEST_P(FacadeAllocationFaults, OfTheNthAloneGiveAWholeAnswerOrARefusalAndLeaveNothingBehind) {
    countUpForEachRequest(false);
}

TEST_P(FacadeAllocationFaults, OfAllFromTheNthOnGiveAWholeAnswerOrARefusalAndLeaveNothingBehind) {
    countUpForEachRequest(true);
}

INSTANTIATE_TEST_SUITE_P(Of, FacadeFaults, testing::ValuesIn(facadeHandlers()), nameOf);
INSTANTIATE_TEST_SUITE_P(Of, FacadeBrokerFaults, testing::ValuesIn(facadeHandlers()), nameOf);
INSTANTIATE_TEST_SUITE_P(Of, FacadeAllocationFaults, testing::ValuesIn(facadeHandlers()), nameOf);

}  // namespace
