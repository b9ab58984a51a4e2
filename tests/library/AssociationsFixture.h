#ifndef TESTS_LIBRARY_ASSOCIATIONS_FIXTURE_H
#define TESTS_LIBRARY_ASSOCIATIONS_FIXTURE_H

#include <string>
#include <vector>

#include "library/LibraryFixture.h"

namespace associations {

using namespace cmpihost;

using Texts = std::vector<std::string>;

inline constexpr const char* noComputerSystem = "Could not obtain an instance of Computer System";

// A path in short: the one key that tells elements of its class apart, "-" when it lacks it.
inline std::string brief(const ObjectPathValue& path) {
    for (const char* name : {"InstanceID", "Name"})
        if (const Value* value = path.key(name)) return value->toText();
    return "-";
}

inline std::string brief(const Value* reference) {
    return reference == nullptr ? "(absent)" : brief(reference->reference());
}

inline Texts briefs(const std::vector<ObjectPathValue>& paths) {
    Texts result;
    for (const ObjectPathValue& path : paths) result.push_back(brief(path));
    return result;
}

inline Texts briefs(const std::vector<InstanceValue>& instances) {
    Texts result;
    for (const InstanceValue& instance : instances) result.push_back(brief(instance.path));
    return result;
}

inline constexpr Association installed = installedOS;
inline constexpr Association running = runningOS;
inline constexpr Association capabilities = elementCapabilities;

class Associations : public LibraryFixture {
  protected:
    // Nodes os1, os2 … and computer systems cs1, cs2 …; the host's own name stays host1.
    void populate(unsigned int nodes, unsigned int computerSystems) {
        Texts names;
        for (unsigned int number = 1; number <= nodes; ++number)
            names.push_back("os" + std::to_string(number));
        setNodes(names);
        names.clear();
        for (unsigned int number = 1; number <= computerSystems; ++number)
            names.push_back("cs" + std::to_string(number));
        computers.setNames(names);
    }

    // The pairs of an enumeration, each as "first+second"; checks that names and instances agree,
    // and that each ends as `ends` says: with returnDone, or with a message and without.
    Texts pairs(const Association& association, const std::string& message = "") {
        recording::clear();
        const Outcome names = enumerateNames(association.className);
        expectEnd(names, message);
        const Outcome instances = enumerate(association.className);
        expectEnd(instances, message);
        Texts result;
        for (const ObjectPathValue& path : names.paths) {
            EXPECT_EQ(path.keys.size(), 2U);
            EXPECT_EQ(path.keys[0].name, association.first);
            EXPECT_EQ(path.keys[1].name, association.second);
            result.push_back(brief(path.key(association.first)) + "+" +
                             brief(path.key(association.second)));
        }
        EXPECT_EQ(pairsOf(instances, association), result);
        return result;
    }

    // The pairs of instances, each as "first+second".
    static Texts pairsOf(const Outcome& outcome, const Association& association) {
        Texts result;
        for (const InstanceValue& instance : outcome.instances) {
            EXPECT_EQ(instance.property("PrimaryOS"), nullptr);
            result.push_back(brief(instance.property(association.first)) + "+" +
                             brief(instance.property(association.second)));
        }
        return result;
    }

    // The pairs that GetInstance gives for a path; checks the end as pairs() does.
    Texts gotten(const ObjectPathValue& asked, const Association& association,
                 const std::string& message = "") {
        recording::clear();
        const Outcome outcome = get(asked);
        expectEnd(outcome, message);
        EXPECT_TRUE(outcome.paths.empty());
        return pairsOf(outcome, association);
    }

    // The far ends from a source; checks that names and instances agree, and the end.
    Texts farEnds(const ObjectPathValue& source, const Association& association,
                  const std::string& message = "") {
        recording::clear();
        const Outcome names = associatorNames(source, association.className);
        expectEnd(names, message);
        const Outcome instances = associators(source, association.className);
        expectEnd(instances, message);
        EXPECT_EQ(briefs(instances.instances), briefs(names.paths));
        return briefs(names.paths);
    }

    void expectEnd(const Outcome& outcome, const std::string& message) {
        EXPECT_EQ(outcome.rc, CMPI_RC_OK);
        EXPECT_FALSE(outcome.message.has_value());
        EXPECT_EQ(outcome.doneCount, message.empty() ? 1U : 0U);
        Texts messages;
        for (const recording::Record& record : recording::take())
            if (record.channel == "log" && record.text.rfind("MESSAGE ", 0) == 0)
                messages.push_back(record.text.substr(record.text.find("]: ") + 3));
        EXPECT_EQ(messages, message.empty() ? Texts{} : Texts{message});
    }
};

}  // namespace associations

#endif
