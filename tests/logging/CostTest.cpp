#include <gtest/gtest.h>
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <malloc.h>
#include <sys/prctl.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <array>
#include <atomic>
#include <csignal>
#include <cstddef>
#include <cstdlib>
#include <fstream>
#include <new>
#include <optional>
#include <string>

#include "ZBLogger.h"
#include "ZBMessageBuffer.h"
#include "framework/logging/Logger.h"
#include "tests/logging/LoggingSupport.h"

namespace {

using namespace ZBLog;
using namespace logging_test;

std::atomic<long> allocations{0};
std::atomic<long> bytesInUse{0};

void* allocate(std::size_t size) {
    void* const memory = std::malloc(size == 0 ? 1 : size);
    if (memory == nullptr) throw std::bad_alloc();
    ++allocations;
    bytesInUse += static_cast<long>(::malloc_usable_size(memory));
    return memory;
}

void release(void* memory) {
    bytesInUse -= static_cast<long>(::malloc_usable_size(memory));
    std::free(memory);
}

}  // namespace

// The forms for arrays call these.
void* operator new(std::size_t size) {
    return allocate(size);
}
void operator delete(void* memory) noexcept {
    release(memory);
}
void operator delete(void* memory, std::size_t) noexcept {
    release(memory);
}

namespace {

constexpr int rounds = 10000;

/// Ends this process at the next system call that is not its own end. False if that cannot be set
/// up.
bool allowNoSystemCall() {
    std::array<sock_filter, 5> program{{
        BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr)),
        BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, SYS_exit, 2, 0),
        BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, SYS_exit_group, 1, 0),
        BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_KILL_PROCESS),
        BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ALLOW),
    }};
    const sock_fprog filter{static_cast<unsigned short>(program.size()), program.data()};
    return ::prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0) == 0 &&
           ::prctl(PR_SET_SECCOMP, SECCOMP_MODE_FILTER, &filter) == 0;
}

/// Runs `work` where a system call is deadly; 0 when it came through.
template <class Work>
int withoutSystemCalls(Work work) {
    return inChildProcess([&] {
        if (!allowNoSystemCall()) return 1;
        work();
        return 0;
    });
}

template <class Work>
long allocationsOf(Work work) {
    const long before = allocations;
    for (int round = 0; round < rounds; ++round) work();
    return allocations - before;
}

/// Expects `work` to make no system call and to allocate nothing, however often it is done.
template <class Work>
void expectFree(Work work) {
    EXPECT_EQ(allocationsOf(work), 0);
    EXPECT_EQ(withoutSystemCalls([&] {
                  for (int round = 0; round < rounds; ++round) work();
              }),
              0);
}

/// How many system calls of this process have written to a file so far, whatever their names:
/// write, writev, pwrite and their like. Nothing where the kernel keeps no account of it.
std::optional<long> writeCalls() {
    std::ifstream account("/proc/self/io");
    for (std::string name; account >> name;) {
        long number = 0;
        account >> number;
        if (name == "syscw:") return number;
    }
    return std::nullopt;
}

class CostTest : public testing::Test {
  protected:
    /// A logger in which each kind of filter keeps something out.
    CostTest() {
        configuration_.of(Channel::log) = everythingTo(Destination::file, folder_.path("log"));
        configuration_.of(Channel::log).level = 3000;
        configuration_.of(Channel::log).categories.add("Zumbrel.OSStatusProvider");
        configuration_.of(Channel::log).categories.add("Other.*");
        logger_.use(configuration_);
    }

    TemporaryDirectory folder_;
    FakeEnvironment environment_;
    Configuration configuration_;
    Logger logger_{environment_};
    const std::string text_ = "ENTERING: G() in A [Line: 3],Parameters List: P";
};

TEST_F(CostTest, FilteredRecordIsFree) {
    expectFree([&] {
        logger_.write(record(text_, 4000));
        logger_.write(record(text_, 3000));
        logger_.write(record(text_, 3000, Channel::trace));
    });
}

TEST_F(CostTest, FilteredRecordOfTheProcessIsFree) {
    ::setenv("ZBLOG_CONF", "", 1);
    const std::string category = "Zumbrel.OperatingSystemProvider";
    const auto write = [&] {
        for (const int level : {3000, 4000}) {
            ZBLogger::logLevelMessage("f", "F.cpp", 1, category, level, nullptr, 0, 0, text_);
            ZBLogger::traceLevelMessage("f", "F.cpp", 1, category, level, nullptr, 0, 0, text_);
        }
    };
    write();
    expectFree(write);
}

TEST_F(CostTest, LookAtTheConfigurationFileComesOnceASecond) {
    environment_.source = {folder_.path("zblog.conf"), false};
    Logger logger(environment_);
    logger.write(record(text_, 4000));
    EXPECT_EQ(withoutSystemCalls([&] {
                  environment_.advance(999);
                  for (int round = 0; round < rounds; ++round) logger.write(record(text_, 4000));
              }),
              0);
    EXPECT_EQ(withoutSystemCalls([&] {
                  environment_.advance(1000);
                  logger.write(record(text_, 4000));
              }),
              1000 + SIGSYS);
}

TEST_F(CostTest, RestingConfigurationFileCostsNoAllocation) {
    environment_.source = {folder_.path("zblog.conf"), true};
    writeFile(environment_.source.path, "log.level = 3000\n");
    environment_.setAhead(60);
    Logger logger(environment_);
    logger.write(record(text_, 4000));
    EXPECT_EQ(allocationsOf([&] {
                  environment_.advance(1000);
                  logger.write(record(text_, 4000));
              }),
              0);
}

TEST_F(CostTest, WrittenRecordCostsOneWriteAndNoAllocation) {
    configuration_.of(Channel::log).categories = {};
    logger_.use(configuration_);
    logger_.write(record(text_));
    const std::optional<long> before = writeCalls();
    EXPECT_EQ(allocationsOf([&] { logger_.write(record(text_)); }), 0);
    if (!before) GTEST_SKIP() << "the kernel does not count writes";
    EXPECT_EQ(*writeCalls() - *before, rounds);
    EXPECT_EQ(textsOf(readFile(folder_.path("log"))).size(), 1u + rounds);
}

TEST_F(CostTest, WarmMessageBufferIsFree) {
    const auto gather = [&] {
        ZBMessageBuffer buffer;
        const std::string* taken = &buffer.str(buffer << text_.c_str());
        taken = &buffer.str(buffer << text_.c_str() << taken);
        ZBMessageBuffer inner;
        static_cast<std::ostream&>(inner) << 4711 << std::hex << 255;
        inner.str(inner);
    };
    gather();
    expectFree(gather);
}

TEST_F(CostTest, MemoryOfAHugeTextIsNotKept) {
    const std::string huge(1000000, 'x');
    const auto gather = [&](const char* text) {
        ZBMessageBuffer buffer;
        buffer.str(buffer << text);
    };
    gather("");
    const long before = bytesInUse;
    gather(huge.c_str());
    EXPECT_LT(bytesInUse - before, 10000);
    {
        ZBMessageBuffer buffer;
        buffer.str(buffer << "first");
        buffer.str(buffer << huge.c_str());
    }
    EXPECT_LT(bytesInUse - before, 10000);
}

}  // namespace
