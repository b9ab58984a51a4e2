// Many threads in the provider at once, through the built library and the real logging, with the
// facade in front of it and without: object managers serve clients in parallel, and nothing that a
// thread asks may show in the answer or in the record lines of another.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <functional>
#include <memory>
#include <numeric>
#include <ostream>
#include <random>
#include <sstream>
#include <thread>
#include <tuple>
#include <utility>

#include "framework/instrumentation/HostSource.h"
#include "host/broker/Invoke.h"
#include "support/ComputerSystemService.h"
#include "support/FixtureTree.h"
#include "support/Requests.h"
#include "support/SimulatedHost.h"

namespace {

using namespace cmpihost;
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
        : name_(server.name), broker_(&schemaCatalogue()), library_(server.file, broker_, {name_}) {
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

// The shapes of the records of a log by the thread that wrote them. A line that is not one whole
// record, "TIME PROCESS THREAD CHANNEL LEVEL CATEGORY FUNCTION FILE:LINE TEXT", of which the text
// alone may hold blanks, is filed under the thread -1.
std::map<long, Shapes> shapesByThread(const std::string& log) {
    std::map<long, Shapes> result;
    std::istringstream stream(log);
    for (std::string line; std::getline(stream, line);) {
        int process = 0;
        long thread = 0;
        char channel[6] = "";
        int begin = 0;
        int end = 0;
        std::sscanf(line.c_str(),
                    "%*4d-%*2d-%*2dT%*2d:%*2d:%*2d.%*3dZ %d %ld %n%5s %*d %*s %*s %*[^: ]:%*d%n",
                    &process, &thread, &begin, channel, &end);
        const std::string text = line.substr(static_cast<std::size_t>(end));
        const std::string shape =
            line.substr(static_cast<std::size_t>(begin), static_cast<std::size_t>(end - begin));
        const std::string second = "Z " + std::to_string(process) + ' ';
        const bool whole = !stream.eof() && text[0] == ' ' &&
                           text.find(second) == std::string::npos &&
                           (channel == std::string("log") || channel == std::string("trace"));
        if (whole)
            result[thread].push_back(shape);
        else
            result[-1].push_back(line);
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

/// What one thread of a group did.
struct Member {
    long thread;                     ///< its number in the records
    std::vector<std::size_t> order;  ///< the tasks in the order in which it did them
    std::vector<std::string> complaints;
};

std::vector<std::size_t> shuffledOrder(std::size_t rounds, std::size_t tasks, unsigned int seed) {
    std::mt19937 random(seed);
    std::vector<std::size_t> round(tasks);
    std::iota(round.begin(), round.end(), std::size_t{0});
    std::vector<std::size_t> result;
    for (std::size_t number = 0; number < rounds; ++number) {
        std::shuffle(round.begin(), round.end(), random);
        result.insert(result.end(), round.begin(), round.end());
    }
    return result;
}

void note(Member& member, const std::string& complaint) {
    if (!complaint.empty()) member.complaints.push_back(complaint);
}

/// Has `threads` threads do all of `tasks` tasks `rounds` times, each in an order of its own,
/// starting together. `task` gets the number of a task and returns a complaint, empty for none.
/// Until all are through, one more thread calls `meanwhile` again and again; what it complains
/// about is in the last member, whose order is as long as it called.
std::vector<Member> runThreadGroup(std::size_t threads, std::size_t rounds, std::size_t tasks,
                                   const std::function<std::string(std::size_t)>& task,
                                   const std::function<std::string()>& meanwhile) {
    std::vector<Member> members(threads + 1);
    std::atomic<std::size_t> waiting{threads};
    std::atomic<std::size_t> running{threads};
    std::vector<std::thread> workers;
    for (std::size_t number = 0; number < threads; ++number) {
        Member& member = members[number];
        member.order = shuffledOrder(rounds, tasks, static_cast<unsigned int>(number));
        workers.emplace_back([&] {
            member.thread = ::syscall(SYS_gettid);
            --waiting;
            while (waiting > 0) std::this_thread::yield();
            for (const std::size_t each : member.order) note(member, task(each));
            --running;
        });
    }
    Member& other = members.back();
    workers.emplace_back([&] {
        other.thread = ::syscall(SYS_gettid);
        while (running > 0) {
            other.order.push_back(other.order.size());
            note(other, meanwhile());
            std::this_thread::yield();
        }
    });
    for (std::thread& worker : workers) worker.join();
    return members;
}

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
