// How many system calls a request takes that is not the first one: monitoring asks every minute.
#include <chrono>
#include <filesystem>
#include <thread>

#include "framework/instrumentation/HostSource.h"
#include "library/LibraryFixture.h"
#include "support/FixtureTree.h"
#include "support/SystemCalls.h"

namespace {

using namespace std::chrono_literals;
using testing::Le;
using testing::SizeIs;

class SystemCalls : public LibraryFixture {
  protected:
    void SetUp() override {
        if (!systemCallsOf([] {})) GTEST_SKIP() << "this process may not trace another";
    }

    // Nothing when the request could not be traced.
    std::vector<long> callsOf(Operation operation) {
        const auto calls = systemCallsOf([&] {
            if (operation == Operation::EnumerateInstances)
                enumerate("KORVA_OperatingSystem");
            else
                enumerateNames("KORVA_OperatingSystem");
        });
        EXPECT_TRUE(calls);
        return calls.value_or(std::vector<long>());
    }
};

TEST_F(SystemCalls, OfThisHostAreFew) {
    VA::setHostSource(nullptr);
    if (std::filesystem::is_regular_file("/etc/os-release")) {
        EXPECT_THAT(callsOf(Operation::EnumerateInstanceNames), SizeIs(2));
    }
    if (std::filesystem::is_directory("/run/systemd/system")) {
        GTEST_SKIP() << "the state is asked of systemd, over a socket";
    }
    std::size_t sessions = 0;
    if (std::filesystem::is_directory("/run/systemd/sessions")) {
        const std::filesystem::directory_iterator all("/run/systemd/sessions"), end;
        sessions = static_cast<std::size_t>(std::distance(all, end));
    }
    EXPECT_THAT(callsOf(Operation::EnumerateInstances), SizeIs(Le(30U + sessions)));
}

// The files of this one are all on a disk, so that the boot time is read each time.
TEST_F(SystemCalls, OfAHostOnWhichNothingChangedAreALookForEachFileThatIsKept) {
    FixtureTree tree;
    tree.writeCompleteHost();
    VA::setHostSource(VA::makeLinuxHost(tree.root()));
    std::this_thread::sleep_for(3s);
    EXPECT_THAT(callsOf(Operation::EnumerateInstanceNames), SizeIs(2));
    // A call each: the names of the kernel, os-release, three dates, a folder of systemd's, that of
    // the sessions and its two files, the limit of memory; four each: proc/stat, meminfo and two
    // limits; six: the names in proc.
    EXPECT_THAT(callsOf(Operation::EnumerateInstances), SizeIs(10 + 16 + 6));
}

TEST_F(SystemCalls, OfAHostThatMayHaveChangedInTheSameInstantReadTheFileAgain) {
    FixtureTree tree;
    tree.writeCompleteHost();
    tree.dateAhead("etc/os-release");
    VA::setHostSource(VA::makeLinuxHost(tree.root()));
    EXPECT_THAT(callsOf(Operation::EnumerateInstanceNames), SizeIs(6));
}

}  // namespace
