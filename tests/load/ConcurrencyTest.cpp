// Many threads in the provider at once, through the built library and the real logging, with the
// facade in front of it and without: object managers serve clients in parallel, and nothing that a
// thread asks may show in the answer or in the record lines of another.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <memory>
#include <ostream>
#include <sstream>
#include <tuple>
#include <utility>

#include "framework/instrumentation/HostSource.h"
#include "host/broker/ComputerSystemService.h"
#include "host/broker/Invoke.h"
#include "load/ThreadGroup.h"
#include "support/FixtureTree.h"
#include "support/Requests.h"
#include "support/SimulatedHost.h"

namespace {

using namespace cmpihost;
using namespace load;
using testing::IsEmpty;

constexpr std::size_t threadCount = 8;

/// Which library answers: its file, and the name of the provider in it.
struct Server {
    const char* file;
    const char* name;
};

/// A built library with the framework's own logging, under a strict broker with the schema that
/// serves one computer system, "host1". Several threads may ask at once.
class LoadedProvider {
  public:
    explicit LoadedProvider(const Server& server)
        : name_(server.name),
          broker_(&schemaCatalogue()),
          library_(server.file, broker_, byName(name_)) {
        broker_.route(ComputerSystemService::className, computers_);
    }

    Outcome answer(const OperationRequest& request) { return invoke(library_, broker_, request); }

    /// Calls both factories again with the same broker, and both cleanups without terminating.
    /// Returns what is wrong with what they answered, empty when nothing is.
    std::string callEntryPointsAgain() {
        if (!callAgain("_Create_InstanceMI", library_.instanceMI())) return "instance interface";
        if (!callAgain("_Create_AssociationMI", library_.associationMI()))
            return "association interface";
        return {};
    }

  private:
    static LoadOptions byName(const std::string& name) {
        LoadOptions options;
        options.providerName = name;
        return options;
    }

    template <class MI>
    bool callAgain(const std::string& factory, MI* interface) {
        using Factory = MI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        const auto make = reinterpret_cast<Factory>(library_.symbol((name_ + factory).c_str()));
        MI* const made = make(broker_.cmpi(), nullptr, &status);
        return made == interface && made->ft->cleanup(made, nullptr, 0).rc == CMPI_RC_OK;
    }

    std::string name_;
    ComputerSystemService computers_{"host1"};
    Broker broker_;
    ProviderLibrary library_;
};

// Whether a request had the same effect twice: status, results, calls of returnDone and what the
// broker caught.
bool sameAnswer(const Outcome& left, const Outcome& right) {
    return left.rc == right.rc && left.message == right.message && left.paths == right.paths &&
           left.instances == right.instances && left.doneCount == right.doneCount &&
           left.violations == right.violations;
}

/// Records without what threads may mix: channel, level, category, function and place, in order.
using Shapes = std::vector<std::string>;

bool isNumber(const std::string& text) {
    return !text.empty() && text.find_first_not_of("0123456789") == std::string::npos;
}

// "TIME PROCESS THREAD CHANNEL LEVEL CATEGORY FUNCTION FILE:LINE TEXT": the fields before the text,
// which alone may hold blanks. Fewer than eight: no record.
std::vector<std::string> fieldsOf(const std::string& line) {
    std::vector<std::string> fields;
    std::size_t begin = 0;
    while (fields.size() < 8) {
        const std::size_t end = line.find(' ', begin);
        if (end == std::string::npos) break;
        fields.push_back(line.substr(begin, end - begin));
        begin = end + 1;
    }
    return fields;
}

bool isTime(const std::string& text) {
    return text.size() == std::string("2026-01-01T00:00:00.000Z").size() && text.back() == 'Z';
}

// Whether the line is one whole record, and no second one begins within it.
bool isWhole(const std::string& line, const std::vector<std::string>& fields) {
    if (fields.size() < 8 || !isTime(fields[0])) return false;
    const std::string& place = fields[7];
    return isNumber(fields[1]) && isNumber(fields[2]) &&
           (fields[3] == "log" || fields[3] == "trace") && isNumber(fields[4]) &&
           isNumber(place.substr(place.rfind(':') + 1)) &&
           line.find("Z " + fields[1] + ' ', fields[0].size()) == std::string::npos;
}

// The shapes of the records of a log by the thread that wrote them. A line that is not one whole
// record is filed under the thread -1.
std::map<long, Shapes> shapesByThread(const std::string& log) {
    std::map<long, Shapes> result;
    std::istringstream stream(log);
    for (std::string line; std::getline(stream, line);) {
        const std::vector<std::string> fields = fieldsOf(line);
        if (stream.eof() || !isWhole(line, fields)) {
            result[-1].push_back(line);
            continue;
        }
        std::string shape;
        for (std::size_t field = 3; field < fields.size(); ++field) shape += fields[field] + ' ';
        result[std::stol(fields[2])].push_back(shape);
    }
    return result;
}

/// A file that others append to: each call gives what came since the last one.
class GrowingFile {
  public:
    explicit GrowingFile(std::string path) : path_(std::move(path)) {}

    std::string readNew() {
        std::ifstream file(path_, std::ios::binary);
        file.seekg(seen_);
        std::ostringstream text;
        if (file && file.peek() != std::ifstream::traits_type::eof()) text << file.rdbuf();
        seen_ += static_cast<std::streamoff>(text.str().size());
        return text.str();
    }

  private:
    std::string path_;
    std::streamoff seen_ = 0;
};

/// Where the nodes come from, and how they are called.
struct Host {
    const char* name;
    std::shared_ptr<VA::HostSource> (*make)(const FixtureTree& tree);
    const char* systemName;
};

void PrintTo(const Host& host, std::ostream* out) {
    *out << host.name;
}

std::shared_ptr<VA::HostSource> simulatedHost(const FixtureTree&) {
    auto host = std::make_shared<VA::SimulatedHost>();
    host->setComputerName("host1");
    for (const char* name : {"os1", "os2", "os3"}) {
        VA::SimulatedHost::Node node = VA::SimulatedHost::plausibleNode();
        node.properties[VA::NodeLexicon::Name] = std::string(name);
        host->addNode(node);
    }
    return host;
}

std::shared_ptr<VA::HostSource> linuxHost(const FixtureTree& tree) {
    tree.writeCompleteHost();
    tree.makeFolder("run/systemd/system");  // so that libsystemd is asked where there is one
    return VA::makeLinuxHost(tree.root());
}

constexpr Host hosts[] = {
    {"SimulatedHost", simulatedHost, "os2"},
    {"LinuxHost", linuxHost, "Test Linux"},
};

/// Who is asked what.
struct Way {
    const char* name;
    Server server;
    std::vector<MixedRequest> (*requests)(const std::string& computer, const std::string& system);
    std::size_t fruitfulOneIn;  ///< at least
};

void PrintTo(const Way& way, std::ostream* out) {
    *out << way.server.name;
}

constexpr Way ways[] = {
    {"",
     {KORVA_BINARY_DIR "/lib/libkorzbosstatusprofileprovider.so.1", "OperatingSystemProvider"},
     mixedRequests,
     6},
    {"ThroughTheFacade",
     {KORVA_BINARY_DIR "/lib/libkorvaosstatusfacade.so.1", "OSStatusFacade"},
     mixedFacadeRequests,
     12},
};

/// The computer's name as the host source tells it: with a fixture tree it is the machine's.
std::string computerName() {
    std::string name = "host1";
    VA::currentHostSource()->openCursor()->readComputerName(name);
    return name;
}

class EightThreads : public testing::TestWithParam<std::tuple<Host, Way>> {
  protected:
    EightThreads() {
        const Host& host = std::get<Host>(GetParam());
        VA::setHostSource(host.make(tree_));
        requests_ = way_.requests(computerName(), host.systemName);
    }
    ~EightThreads() override {
        ::unsetenv("ZBLOG_CONF");
        VA::setHostSource(nullptr);
    }

    // To be called before anything is asked.
    void configureLog(const std::string& rest) {
        tree_.write("zblog.conf", "log.sink = file:" + logFile_ + "\nlog.records = all\n" + rest);
        ::setenv("ZBLOG_CONF", tree_.path("zblog.conf").c_str(), 1);
    }

    // Every source has 19 requests: one in three still meets every operation, source and class.
    void keepOneRequestIn(std::size_t count) {
        std::vector<MixedRequest> kept;
        for (std::size_t at = 0; at < requests_.size(); at += count) kept.push_back(requests_[at]);
        requests_ = std::move(kept);
    }

    // Asks each request alone; keeps its answer, and the shapes of its records.
    void askAlone(LoadedProvider& loaded) {
        std::size_t fruitful = 0;
        for (const MixedRequest& each : requests_) {
            alone_.push_back(loaded.answer(each.request));
            if (!alone_.back().paths.empty() || !alone_.back().instances.empty()) ++fruitful;
            EXPECT_TRUE(each.allows(alone_.back().rc)) << describe(each.request);
            shapes_.push_back(shapesByThread(log_.readNew())[::getpid()]);
        }
        EXPECT_GE(fruitful, requests_.size() / way_.fruitfulOneIn) << "requests that give anything";
    }

    // Asks every request on every thread while the entry points are called again.
    void askAtOnce(LoadedProvider& loaded, std::size_t rounds) {
        const auto task = [&](std::size_t number) {
            const OperationRequest& request = requests_[number].request;
            return sameAnswer(loaded.answer(request), alone_[number]) ? "" : describe(request);
        };
        members_ = runThreadGroup(threadCount, rounds, requests_.size(), task,
                                  [&] { return loaded.callEntryPointsAgain(); });
        for (const Member& member : members_) EXPECT_THAT(member.complaints, IsEmpty());
        EXPECT_GT(members_.back().order.size(), 1U) << "calls of the entry points meanwhile";
    }

    // The records that a member left if nothing of others came between.
    Shapes expectedShapes(const Member& member) const {
        Shapes result;
        for (const std::size_t number : member.order)
            result.insert(result.end(), shapes_[number].begin(), shapes_[number].end());
        return result;
    }

    const Way way_ = std::get<Way>(GetParam());
    FixtureTree tree_;
    const std::string logFile_ = tree_.path("log");
    GrowingFile log_{logFile_};
    std::vector<MixedRequest> requests_{};
    std::vector<Outcome> alone_{};
    std::vector<Shapes> shapes_{};
    std::vector<Member> members_{};
};

TEST_P(EightThreads, GetTheAnswersOfEachRequestAsWhenItIsAlone) {
    configureLog("log.level = 0\n");
    LoadedProvider loaded(way_.server);
    askAlone(loaded);
    askAtOnce(loaded, 2);
    EXPECT_EQ(log_.readNew(), "");
}

TEST_P(EightThreads, WriteTheRecordsOfTheirOwnRequestsEachALineOfItsOwn) {
    configureLog("log.level = 4000\ntrace.sink = file:" + logFile_ + "\n");
    keepOneRequestIn(3);
    LoadedProvider loaded(way_.server);
    askAlone(loaded);
    askAtOnce(loaded, 1);
    std::map<long, Shapes> written = shapesByThread(log_.readNew());
    EXPECT_THAT(written[-1], IsEmpty());
    members_.pop_back();  // factories and cleanups leave no records
    for (const Member& member : members_) {
        EXPECT_FALSE(written[member.thread].empty());
        EXPECT_TRUE(written[member.thread] == expectedShapes(member)) << member.thread;
        written.erase(member.thread);
    }
    written.erase(-1);
    EXPECT_THAT(written, IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(On, EightThreads,
                         testing::Combine(testing::ValuesIn(hosts), testing::ValuesIn(ways)),
                         [](const auto& row) {
                             return std::string(std::get<Host>(row.param).name) +
                                    std::get<Way>(row.param).name;
                         });

}  // namespace
