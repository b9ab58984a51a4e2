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
#include "instrumentation/FixtureTree.h"
#include "load/Crowd.h"
#include "load/Loaded.h"
#include "load/RecordShapes.h"
#include "load/Requests.h"
#include "support/SimulatedHost.h"

// Many threads in the provider at once, through the built library and the real logging, with the
// facade in front of it and without.

namespace {

using namespace load;
using cmpihost::Outcome;
using testing::IsEmpty;

constexpr std::size_t threadCount = 8;

/// A file that others append to: each call gives what came since the last one.
class GrowingFile {
  public:
    explicit GrowingFile(std::string path) : path_(std::move(path)) {}

    std::string news() {
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
    {"", provider, mixedRequests, 6},
    {"ThroughTheFacade", facade, facadeRequests, 12},
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
    void askAlone(Loaded& loaded) {
        std::size_t fruitful = 0;
        for (const MixedRequest& each : requests_) {
            alone_.push_back(loaded.answer(each.request));
            if (!alone_.back().paths.empty() || !alone_.back().instances.empty()) ++fruitful;
            EXPECT_TRUE(each.allows(alone_.back().rc)) << describe(each.request);
            shapes_.push_back(shapesByThread(log_.news())[::getpid()]);
        }
        EXPECT_GE(fruitful, requests_.size() / way_.fruitfulOneIn) << "requests that give anything";
    }

    // Asks every request on every thread while the entry points are called again.
    void askAtOnce(Loaded& loaded, std::size_t rounds) {
        const auto task = [&](std::size_t number) {
            const cmpihost::OperationRequest& request = requests_[number].request;
            return sameAnswer(loaded.answer(request), alone_[number]) ? "" : describe(request);
        };
        members_ = runCrowd(threadCount, rounds, requests_.size(), task,
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
    Loaded loaded(way_.server);
    askAlone(loaded);
    askAtOnce(loaded, 2);
    EXPECT_EQ(log_.news(), "");
}

TEST_P(EightThreads, WriteTheRecordsOfTheirOwnRequestsEachALineOfItsOwn) {
    configureLog("log.level = 4000\ntrace.sink = file:" + logFile_ + "\n");
    keepOneRequestIn(3);
    Loaded loaded(way_.server);
    askAlone(loaded);
    askAtOnce(loaded, 1);
    std::map<long, Shapes> written = shapesByThread(log_.news());
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
