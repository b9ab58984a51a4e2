#include <gtest/gtest.h>
#include <pthread.h>

#include <atomic>
#include <thread>

#include "framework/logging/Logger.h"
#include "tests/logging/LoggingSupport.h"

namespace {

using logging_test::everythingTo;
using logging_test::readFile;
using logging_test::record;
using logging_test::textsOf;
using ZBLog::Channel;
using ZBLog::Destination;

TEST(Cancellation, MayHitAThreadWhileItWrites) {
    const logging_test::TemporaryFolder folder;
    logging_test::FakeEnvironment environment;
    ZBLog::Logger logger(environment);
    ZBLog::Configuration configuration;
    configuration.of(Channel::log) = everythingTo(Destination::file, folder / "log");
    logger.use(configuration);
    struct Work {
        ZBLog::Logger& logger;
        std::atomic<bool> started{false};
    };
    for (int round = 0; round < 20; ++round) {
        Work work{logger};
        pthread_t thread{};
        const auto writeForever = [](void* argument) -> void* {
            auto& own = *static_cast<Work*>(argument);
            for (;;) {
                own.logger.write(record("one"));
                own.started = true;
                ::pthread_testcancel();
            }
        };
        ASSERT_EQ(::pthread_create(&thread, nullptr, writeForever, &work), 0);
        while (!work.started) std::this_thread::yield();
        ::pthread_cancel(thread);
        void* result = nullptr;
        ::pthread_join(thread, &result);
        EXPECT_EQ(result, PTHREAD_CANCELED);
    }
    logger.write(record("last"));
    EXPECT_EQ(textsOf(readFile(folder / "log")).back(), "last");
}

}  // namespace
