// A broker whose n-th call fails, or returns null, n counted up until none fails any more.
#include <algorithm>

#include "faults/FaultFixture.h"

namespace {

using namespace cmpihost;
using Texts = std::vector<std::string>;

const char* const noComputerSystem = "Could not obtain an instance of Computer System";
const Texts exceptionTexts = {noComputerSystem, "Object Not Found.",
                              "Could not find 'Name' Key in Moniker",
                              "Could not find 'CSName' or 'Name' Key in Moniker",
                              "Could not find 'InstanceID' Key in Moniker"};

/// What is due for the elements of an answer, in view of the reference.
enum class Elements {
    Same,
    None,
    OneLess,          ///< the others as they were
    EndEarly,         ///< those before the failure
    LackOneProperty,  ///< one of one instance, unless another call supplied it as well
    SayLess,  ///< what the host has, with some keys less, or of a walk that was narrowed less
};

/// What is due when a call of an entry fails.
struct Rule {
    const char* entry;
    Elements elements;
    Texts messages;  ///< besides that of the reference
};

const Rule rules[] = {
    {"CMPIBrokerFT.enumerateInstances", Elements::None, {noComputerSystem}},
    {"CMPIEnumerationFT.hasNext", Elements::EndEarly, {noComputerSystem}},
    {"CMPIEnumerationFT.getNext", Elements::SayLess, {noComputerSystem}},
    {"CMPIInstanceFT.getObjectPath", Elements::SayLess, {}},
    {"CMPIBrokerEncFT.newInstance", Elements::EndEarly, {}},
    {"CMPIBrokerEncFT.newObjectPath", Elements::SayLess, exceptionTexts},
    {"CMPIBrokerEncFT.newArray", Elements::LackOneProperty, {}},
    {"CMPIArrayFT.setElementAt", Elements::LackOneProperty, {}},
    {"CMPIBrokerEncFT.newDateTimeFromChars", Elements::LackOneProperty, {}},
    {"CMPIInstanceFT.setProperty", Elements::LackOneProperty, {}},
    {"CMPIResultFT.returnObjectPath", Elements::OneLess, {}},
    {"CMPIResultFT.returnInstance", Elements::OneLess, {}},
    {"CMPIResultFT.returnDone", Elements::Same, {}},
    {"CMPIObjectPathFT.getClassName", Elements::None, {}},
    {"CMPIObjectPathFT.getNameSpace", Elements::SayLess, {}},
    {"CMPIObjectPathFT.addKey", Elements::SayLess, exceptionTexts},
    {"CMPIObjectPathFT.getKey", Elements::SayLess, exceptionTexts},
    {"CMPIObjectPathFT.getKeyAt", Elements::SayLess, exceptionTexts},
    {"CMPIObjectPathFT.getKeyCount", Elements::SayLess, exceptionTexts},
    {"CMPIStringFT.getCharPtr", Elements::SayLess, exceptionTexts},
};

const Rule* ruleOf(const std::string& entry) {
    const Rule* rule = std::find_if(std::begin(rules), std::end(rules),
                                    [&](const Rule& each) { return each.entry == entry; });
    return rule == std::end(rules) ? nullptr : rule;
}

bool contains(const Texts& texts, const std::string& text) {
    return std::find(texts.begin(), texts.end(), text) != texts.end();
}

std::size_t propertiesIn(const Answer& answer) {
    std::size_t count = 0;
    for (const InstanceValue& instance : answer.outcome.instances)
        count += instance.properties.size();
    return count;
}

// True for the path, or one that lacks keys or its namespace; in references as well.
bool saysLess(const ObjectPathValue& path, const ObjectPathValue& whole);

bool saysLess(const Value& value, const Value* whole) {
    if (whole == nullptr || value == *whole) return whole != nullptr;
    return value.type() == CMPI_ref && whole->type() == CMPI_ref && !value.isNull() &&
           saysLess(value.reference(), whole->reference());
}

bool saysLess(const ObjectPathValue& path, const ObjectPathValue& whole) {
    return path.className == whole.className &&
           (path.nameSpace == whole.nameSpace || path.nameSpace.empty()) &&
           std::all_of(path.keys.begin(), path.keys.end(), [&](const KeyBinding& key) {
               return saysLess(key.value, whole.key(key.name));
           });
}

bool saysLess(const InstanceValue& instance, const InstanceValue& whole) {
    return saysLess(instance.path, whole.path) &&
           std::all_of(instance.properties.begin(), instance.properties.end(),
                       [&](const PropertyValue& property) {
                           return saysLess(property.value, whole.property(property.name));
                       });
}

// Each element says what one of the host's says, or less.
bool saysLess(const Answer& answer, const std::vector<InstanceValue>& all) {
    const auto isKnown = [&](const auto& element, auto partOf) {
        return std::any_of(all.begin(), all.end(), [&](const InstanceValue& whole) {
            return saysLess(element, partOf(whole));
        });
    };
    for (const ObjectPathValue& path : answer.outcome.paths)
        if (!isKnown(path, [](const InstanceValue& whole) { return whole.path; })) return false;
    for (const InstanceValue& instance : answer.outcome.instances)
        if (!isKnown(instance, [](const InstanceValue& whole) { return whole; })) return false;
    return true;
}

bool areDue(Elements due, const Answer& answer, const Answer& reference,
            const std::vector<InstanceValue>& all) {
    switch (due) {
        case Elements::Same:
            return answer.elements == reference.elements;
        case Elements::None:
            return answer.elements.empty();
        case Elements::OneLess:
            return answer.elements.size() + 1 == reference.elements.size() &&
                   isSubsequence(answer.elements, reference.elements);
        case Elements::EndEarly:
            return isPrefix(answer.elements, reference.elements);
        case Elements::LackOneProperty:
            return texts(answer.outcome.instances) == texts(reference.outcome.instances) &&
                   propertiesIn(answer) + 1 >= propertiesIn(reference) &&
                   (answer.elements == reference.elements ||
                    propertiesIn(answer) < propertiesIn(reference));
        case Elements::SayLess:
            return saysLess(answer, all);
    }
    return false;
}

/// One fault and what came of it.
struct Trial {
    FaultPlan plan;
    Answer answer;
    Texts violations;
};

class BrokerFaults : public FaultsOfHandler {
  protected:
    BrokerFaults() {
        for (const char* className : {"KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities"})
            for (const InstanceValue& each : answerTo(enumerationOf(className)).outcome.instances)
                all.push_back(each);
        const OperationRequest ofComputers = enumerationOf("KORVA_ComputerSystem").request;
        for (const InstanceValue& each : computers.perform(broker, ofComputers).instances)
            all.push_back(each);
        addPairs(installedOS, "KORVA_ComputerSystem", "KORVA_OperatingSystem");
        addPairs(runningOS, "KORVA_OperatingSystem", "KORVA_ComputerSystem");
        addPairs(elementCapabilities, "KORVA_OperatingSystem", "KORVA_OperatingSystemCapabilities");
    }

    // Has the n-th call fail, and `times` of them from there on, 0 for all; `check` looks at what
    // is due besides what holds for each fault.
    template <class Check>
    void countCallsUp(unsigned times, Check check) {
        forEachRequest([&] {
            for (const CMPIrc rc : {CMPI_RC_ERR_FAILED, CMPI_RC_OK})
                countUp("call", [&](std::size_t n) {
                    SCOPED_TRACE(testing::Message() << "rc " << rc);
                    Trial trial;
                    if (!run(trial, n, times, rc)) return false;
                    expectAnswered(trial);
                    EXPECT_EQ(trial.answer.outcome.rc,
                              classIsUnknown(n) ? CMPI_RC_ERR_INVALID_CLASS : CMPI_RC_OK);
                    check(trial);
                    return true;
                });
        });
    }

    // False when no call failed.
    bool run(Trial& trial, std::size_t n, unsigned times, CMPIrc rc) {
        trial.plan.add({"", static_cast<unsigned>(n), times, rc});
        broker.setFaultPlan(&trial.plan);
        trial.answer = answerTo(asked);
        broker.setFaultPlan(nullptr);
        trial.violations = broker.takeViolations();
        return trial.plan.fired() != 0;
    }

    // What holds for each fault.
    void expectAnswered(const Trial& trial) const {
        expectSound(asked, trial.answer);
        const bool refused = trial.answer.outcome.rc == CMPI_RC_ERR_INVALID_CLASS;
        const bool ended = !refused && trial.answer.messages.empty();
        EXPECT_EQ(trial.plan.calls("CMPIResultFT.returnDone"), ended ? 1U : 0U);
    }

    void expectDue(const Trial& trial, const Rule& rule) const {
        // A walk that is not narrowed gives so many.
        const bool ofPairs = asked.request.path.className == elementCapabilities.className;
        EXPECT_LE(trial.answer.elements.size(), ofPairs ? 3U : 2U);
        EXPECT_TRUE(areDue(rule.elements, trial.answer, reference, all))
            << testing::PrintToString(trial.answer.elements);
        for (const std::string& message : trial.answer.messages)
            EXPECT_TRUE(contains(rule.messages, message) || message == asked.message) << message;
        // The result notes a path that lacks a key; nothing else may be wrong.
        for (const std::string& violation : trial.violations) {
            const bool missingKey = violation.rfind("path of ", 0) == 0 &&
                                    violation.find(" without key ") != std::string::npos;
            EXPECT_TRUE(missingKey && (rule.elements == Elements::SayLess ||
                                       contains(referenceViolations, violation)))
                << violation;
        }
    }

    // The class of the request is asked for first: its name, and the characters of that.
    bool classIsUnknown(std::size_t n) const {
        const Operation operation = asked.request.operation;
        const bool byAssociation =
            operation == Operation::Associators || operation == Operation::AssociatorNames;
        return !byAssociation && n <= 2;
    }

    std::vector<InstanceValue> all;  ///< what the host has, in full, with every pair that can be

  private:
    static NamedRequest enumerationOf(const std::string& className) {
        return {"", "", requestFor(Operation::EnumerateInstances, path(className))};
    }

    void addPairs(const Association& association, const std::string& first,
                  const std::string& second) {
        const std::vector<InstanceValue> ends = all;
        for (const InstanceValue& one : ends)
            for (const InstanceValue& other : ends) {
                if (one.path.className != first || other.path.className != second) continue;
                InstanceValue pair;
                pair.path = pairPath(association, one.path, other.path);
                for (const KeyBinding& key : pair.path.keys)
                    pair.properties.push_back({key.name, key.value});
                all.push_back(pair);
            }
    }
};

TEST_P(BrokerFaults, ReferenceIsWhatIsDue) {
    forEachRequest([this] {
        expectSound(asked, reference);
        EXPECT_EQ(reference.messages, asked.message.empty() ? Texts{} : Texts{asked.message});
        EXPECT_EQ(reference.outcome.doneCount, asked.message.empty() ? 1U : 0U);
    });
}

TEST_P(BrokerFaults, NthCallAloneFailsAndOnlyWhatHangsOnItIsMissing) {
    countCallsUp(1, [this](const Trial& trial) {
        const std::string entry = trial.plan.firedCalls().front();
        SCOPED_TRACE(entry);
        const Rule* rule = ruleOf(entry);
        ASSERT_NE(rule, nullptr);
        expectDue(trial, *rule);
    });
}

TEST_P(BrokerFaults, EveryCallFromTheNthOnFailsAndTheRequestStillEnds) {
    countCallsUp(0, [this](const Trial& trial) {
        // Nothing is handed over from there on.
        EXPECT_TRUE(isPrefix(trial.answer.elements, reference.elements));
        for (const std::string& message : trial.answer.messages)
            EXPECT_TRUE(contains(exceptionTexts, message)) << message;
        for (const std::string& violation : trial.violations)
            EXPECT_TRUE(contains(referenceViolations, violation)) << violation;
    });
}

INSTANTIATE_TEST_SUITE_P(Of, BrokerFaults, testing::ValuesIn(servingHandlers()), nameOf);

class UnservedRequests : public FaultFixture {};

TEST_F(UnservedRequests, OfAnotherClassAreInvalidWhateverCallFails) {
    for (const NamedRequest& asked : unservedRequests({"host1", "Linux", "other"})) {
        for (unsigned n = 1; n <= 3; ++n) {
            FaultPlan plan(Fault{"", n, 0, CMPI_RC_ERR_FAILED});
            broker.setFaultPlan(&plan);
            const Answer answer = answerTo(asked);
            broker.setFaultPlan(nullptr);
            EXPECT_EQ(answer.outcome.rc, CMPI_RC_ERR_INVALID_CLASS) << asked;
            EXPECT_LE(plan.calls(), 2U) << asked;
            expectSound(asked, answer);
        }
    }
}

}  // namespace
