// A Linux host whose n-th read fails, n counted up until none fails any more: what came from the
// file that could not be read is absent or comes from the next source, and nothing else changes.
#include <sys/utsname.h>

#include <algorithm>
#include <ctime>

#include "faults/FaultFixture.h"
#include "faults/FileFaults.h"
#include "framework/instrumentation/HostSource.h"
#include "support/FixtureTree.h"
#include "support/Properties.h"

namespace {

using namespace cmpihost;
using fileFaults::Fault;
using Texts = std::vector<std::string>;

const char* const absent = "(absent)";
const char* const another = "(another value)";
const char* const some = "(some value)";

/// A property, and what it is when its source cannot be read.
struct Property {
    std::string name;
    std::string value;
};

struct Source {
    std::string path;
    std::vector<Property> properties;
};

std::vector<Source> sources(Fault fault) {
    utsname kernel;
    EXPECT_EQ(::uname(&kernel), 0);
    // A session that cannot be read may be one of a user; one that has gone, or tells of no user,
    // is none.
    const bool unreadable = fault == Fault::Denied || fault == Fault::Error;
    const char* const users = unreadable ? absent : "1";
    std::vector<Property> memory;
    for (const PublishedProperty& each : operatingSystemProperties)
        if (each.source == std::string("proc/meminfo")) memory.push_back({each.name, absent});
    return {
        {"etc/os-release", {{"Name", kernel.sysname}, {"Version", kernel.release}}},
        // The kernel tells when it was booted as well: before the tree was made.
        {"proc/stat", {{"LastBootUpTime", another}, {"InstallDate", absent}}},
        {"proc/meminfo", memory},
        {"proc/sys/kernel/pid_max", {{"MaxNumberOfProcesses", "127412"}}},
        {"proc/sys/kernel/threads-max", {}},
        {"proc", {{"NumberOfProcesses", absent}}},
        {"run/systemd/system", {}},
        {"run/systemd/sessions", {{"NumberOfUsers", absent}}},
        {"run/systemd/sessions/1", {{"NumberOfUsers", users}}},
        {"run/systemd/sessions/c2", {{"NumberOfUsers", users}}},
        {"", {{"InstallDate", some}}},
        {"etc/machine-id", {{"InstallDate", absent}}},
    };
}

struct Row {
    const char* name;
    Fault fault;
    bool harmless;  ///< the reader goes on and gets everything
};

const Row rows[] = {
    {"Missing", Fault::Missing, false},    {"Denied", Fault::Denied, false},
    {"Gone", Fault::Gone, false},          {"Error", Fault::Error, false},
    {"Garbage", Fault::Garbage, false},    {"CutShort", Fault::CutShort, false},
    {"Piecemeal", Fault::Piecemeal, true}, {"Interrupted", Fault::Interrupted, true},
};

std::ostream& operator<<(std::ostream& out, const Row& row) {
    return out << row.name;
}

class HostFiles : public FaultFixture, public testing::WithParamInterface<Row> {
  protected:
    HostFiles() {
        VA::setHostSource(VA::makeLinuxHost(tree.root()));
        writeHost();
    }
    ~HostFiles() override { fileFaults::release(); }

    // The host was booted after the tree was made, and tells so at the end of a long file.
    void writeHost() const {
        tree.writeCompleteHost();
        tree.write("proc/stat", "cpu  1 2 3 4\nintr " + std::string(40000, '0') + "\nbtime " +
                                    std::to_string(bootTime) + "\nprocesses 4711\n");
        // However long the test takes, each request reads everything.
        for (const char* name : {"etc/os-release", "run/systemd/sessions"}) tree.dateAhead(name);
    }

    // The path that met the fault.
    std::string serve(const NamedRequest& asked, std::size_t n, Answer& answer) {
        fileFaults::meet(GetParam().fault, static_cast<unsigned>(n), tree.root());
        answer = answerTo(asked);
        broker.takeViolations();
        const std::string met = fileFaults::release();
        if (GetParam().fault == Fault::Gone) writeHost();
        return met;
    }

    const std::time_t bootTime = std::time(nullptr) + 1000;
    FixtureTree tree;
};

Texts propertyNames(const InstanceValue& instance) {
    Texts names;
    for (const auto& property : instance.properties) names.push_back(property.name);
    return names;
}

void expectLike(const InstanceValue& reference, const InstanceValue& instance,
                const Source& broken) {
    Texts names = propertyNames(reference);
    for (const std::string& name : propertyNames(instance))
        if (reference.property(name) == nullptr) names.push_back(name);
    for (const std::string& name : names) {
        const auto changed = std::find_if(broken.properties.begin(), broken.properties.end(),
                                          [&](const Property& each) { return each.name == name; });
        const std::string value = text(instance, name);
        if (changed == broken.properties.end()) {
            EXPECT_EQ(value, text(reference, name)) << name;
        } else if (changed->value == another) {
            EXPECT_NE(value, absent) << name;
            EXPECT_NE(value, text(reference, name)) << name;
        } else if (changed->value == some) {
            EXPECT_NE(value, absent) << name;
        } else {
            EXPECT_EQ(value, changed->value) << name;
        }
    }
}

TEST_P(HostFiles, OfWhichOneCannotBeReadCostOnlyWhatItTells) {
    const std::vector<Source> table = sources(GetParam().fault);
    const NamedRequest enumeration = requestsOf("OperatingSystem_EnumInstances").front();
    Answer reference;
    ASSERT_EQ(serve(enumeration, 0, reference), "(none)");
    ASSERT_EQ(reference.outcome.instances.size(), 1U);
    EXPECT_EQ(reference.outcome.instances[0].properties.size(),
              std::size(operatingSystemProperties));
    const std::size_t end = countUp("call", [&](std::size_t n) {
        Answer answer;
        const std::string met = serve(enumeration, n, answer);
        if (met == "(none)") return false;
        SCOPED_TRACE("for \"" + met + '"');
        const auto source = std::find_if(table.begin(), table.end(),
                                         [&](const Source& each) { return each.path == met; });
        EXPECT_NE(source, table.end());
        EXPECT_EQ(answer.outcome.instances.size(), 1U);
        if (source == table.end() || answer.outcome.instances.empty()) return false;
        expectSound(enumeration, answer);
        EXPECT_EQ(recordsOf(answer), recordsOf(reference));
        EXPECT_EQ(answer.outcome.doneCount, 1U);
        expectLike(reference.outcome.instances[0], answer.outcome.instances[0],
                   GetParam().harmless ? Source{} : *source);
        return true;
    });
    EXPECT_GT(end, 6U);
}

TEST_P(HostFiles, OfWhichOneCannotBeReadLeaveEveryOtherRequestAnswered) {
    for (const NamedRequest& asked : servedRequests({"host1", "Linux", "other"})) {
        SCOPED_TRACE(asked.name);
        Answer reference;
        serve(asked, 0, reference);
        countUp("call", [&](std::size_t n) {
            Answer answer;
            if (serve(asked, n, answer) == "(none)") return false;
            expectSound(asked, answer);
            EXPECT_EQ(answer.outcome.rc, CMPI_RC_OK);
            EXPECT_EQ(answer.messages, reference.messages);
            EXPECT_EQ(answer.outcome.doneCount, reference.outcome.doneCount);
            return true;
        });
    }
}

INSTANTIATE_TEST_SUITE_P(By, HostFiles, testing::ValuesIn(rows),
                         [](const auto& row) { return row.param.name; });

}  // namespace
