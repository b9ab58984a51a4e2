#include "framework/logging/ObjectPool.h"

#include <gtest/gtest.h>

#include <atomic>
#include <thread>
#include <vector>

namespace {

std::atomic<int> living{0};

struct Counted {
    Counted() { ++living; }
    ~Counted() { --living; }
    std::atomic<bool> inUse{false};
};

using Pool = ZBLog::ObjectPool<Counted, 4>;

TEST(ObjectPool, GivesBackWhatItWasGiven) {
    Pool pool;
    EXPECT_EQ(pool.take(), nullptr);
    auto object = std::make_unique<Counted>();
    const Counted* const address = object.get();
    pool.give(std::move(object));
    EXPECT_EQ(pool.take().get(), address);
    EXPECT_EQ(pool.take(), nullptr);
    EXPECT_EQ(living, 0);
}

TEST(ObjectPool, KeepsAsManyAsItHasPlaces) {
    Pool pool;
    for (int count = 0; count < 10; ++count) pool.give(std::make_unique<Counted>());
    EXPECT_EQ(living, 4);
    pool.close();
    EXPECT_EQ(living, 0);
}

TEST(ObjectPool, KeepsNothingAfterItsEnd) {
    Pool pool;
    pool.close();
    pool.give(std::make_unique<Counted>());
    EXPECT_EQ(living, 0);
    EXPECT_EQ(pool.take(), nullptr);
}

TEST(ObjectPool, NeverLendsAnObjectTwice) {
    Pool pool;
    std::atomic<int> shared{0};
    std::vector<std::thread> users;
    for (int user = 0; user < 8; ++user) {
        users.emplace_back([&] {
            for (int count = 0; count < 5000; ++count) {
                auto object = pool.take();
                if (!object) object = std::make_unique<Counted>();
                if (object->inUse.exchange(true)) ++shared;
                object->inUse = false;
                pool.give(std::move(object));
            }
        });
    }
    for (std::thread& user : users) user.join();
    EXPECT_EQ(shared, 0);
    pool.close();
    EXPECT_EQ(living, 0);
}

}  // namespace
