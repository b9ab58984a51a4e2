// The buffer that gathers a record's text, and the pool that keeps what buffers work with.
#include <gtest/gtest.h>

#include <atomic>
#include <deque>
#include <iomanip>
#include <locale>
#include <sstream>
#include <thread>
#include <vector>

#include "ZBMessageBuffer.h"
#include "framework/logging/ObjectPool.h"

namespace {

using ZBLog::ZBMessageBuffer;

TEST(MessageBuffer, GathersTextsInOrderAndIsEmptyAfterItsTextWasTaken) {
    ZBMessageBuffer buffer;
    const char* const none = nullptr;
    for (int twin = 0; twin < 2; ++twin) {
        EXPECT_EQ(buffer.str(buffer << "METHOD" << none << ": "
                                    << "G()"),
                  "METHOD: G()");
    }
    EXPECT_EQ(buffer.str(buffer), "");
}

TEST(MessageBuffer, TakenTextStaysWhileTheNextIsGathered) {
    ZBMessageBuffer buffer;
    const std::string& taken = buffer.str(buffer << "one");
    buffer << "two";
    static_cast<std::ostream&>(buffer) << 3;
    EXPECT_EQ(taken, "one");
    EXPECT_EQ(buffer.str(buffer), "two3");
}

TEST(MessageBuffer, HoldsTextOfAnyLength) {
    ZBMessageBuffer buffer;
    const std::string huge(3000000, 'x');
    EXPECT_EQ(buffer.str(buffer << huge.c_str()), huge);
    EXPECT_EQ(buffer.str(buffer << "small"), "small");
}

TEST(MessageBuffer, PrintsPointersAsStreamsDo) {
    int object = 0;
    const int* const constant = &object;
    const char* text = "text";
    const int* const none = nullptr;
    const void* const address = &object;
    std::ostringstream expected;
    expected << "p=" << address << " " << address << " " << static_cast<const void*>(&text) << " "
             << static_cast<const void*>(nullptr);

    ZBMessageBuffer buffer;
    buffer << "p=" << &object;
    buffer << " " << constant;
    buffer << " " << &text;
    EXPECT_EQ(buffer.str(buffer << " " << none), expected.str());
}

TEST(MessageBuffer, PrintsPointersInTheFormatThatTheStreamWasGiven) {
    int object = 0;
    const void* const address = &object;
    ZBMessageBuffer buffer;
    std::ostringstream filled, usual, left;
    filled << address << std::setw(24) << std::setfill('*') << address;
    EXPECT_EQ(buffer.str((buffer << &object) << std::setw(24) << std::setfill('*') << address),
              filled.str());
    // Taking the text brings the usual format back, after a pointer too.
    usual << address << 255;
    EXPECT_EQ(buffer.str((buffer << &object) << 255), usual.str());
    (buffer << &object) << std::setw(24) << std::left;
    left << address << std::setw(24) << std::left << address;
    EXPECT_EQ(buffer.str(buffer << &object), left.str());
}

TEST(MessageBuffer, MixesTextAndStreamInOrder) {
    ZBMessageBuffer buffer;
    std::ostream& stream = buffer;
    stream << "a" << 1;
    buffer << "b";
    stream << 2.5 << 'c' << std::string("d") << true << std::endl;
    EXPECT_EQ(buffer.str(stream), "a1b2.5cd1\n");
}

void expectNew(const std::ostream& stream) {
    const std::ostringstream fresh;
    EXPECT_EQ(stream.rdstate(), fresh.rdstate());
    EXPECT_EQ(stream.flags(), fresh.flags());
    EXPECT_EQ(stream.fill(), fresh.fill());
    EXPECT_EQ(stream.precision(), fresh.precision());
    EXPECT_EQ(stream.width(), fresh.width());
    EXPECT_EQ(stream.tie(), fresh.tie());
    EXPECT_EQ(stream.exceptions(), fresh.exceptions());
}

TEST(MessageBuffer, BeginsAnewWhenItsTextIsTakenAndInThePlaceOfAnother) {
    std::ostringstream elsewhere;
    const auto spoil = [&](std::ostream& stream) {
        stream << "left behind" << std::hex << std::showbase << std::boolalpha << std::setfill('*')
               << std::setprecision(2) << std::setw(9);
        stream.tie(&elsewhere);
        stream.rdbuf(elsewhere.rdbuf());
        stream.setstate(std::ios::failbit);
        stream.exceptions(std::ios::badbit);
    };
    for (int round = 0; round < 100; ++round) {
        ZBMessageBuffer buffer;
        std::ostream& stream = buffer;
        expectNew(stream);
        EXPECT_EQ(buffer.str(stream << std::setw(3) << 1 << 255 << ' ' << 3.14159 << true),
                  "  1255 3.141591");
        spoil(stream);
        EXPECT_EQ(buffer.str(stream), "left behind");
        expectNew(stream);
        EXPECT_EQ(buffer.str(stream << std::hex << std::showbase << 255), "0xff");
        EXPECT_EQ(buffer.str(stream << 255), "255");
        spoil(stream);
    }
    EXPECT_EQ(elsewhere.str(), "");
}

TEST(MessageBuffer, ForgetsAFailedInsertion) {
    ZBMessageBuffer buffer;
    std::ostream& stream = buffer;
    stream << "a" << static_cast<std::streambuf*>(nullptr) << "lost";
    EXPECT_EQ(buffer.str(stream), "a");
    EXPECT_EQ(buffer.str(stream << "b"), "b");
    stream.exceptions(std::ios::badbit);
    EXPECT_ANY_THROW(stream << static_cast<std::streambuf*>(nullptr));
    EXPECT_EQ(buffer.str(stream), "");
    EXPECT_EQ(buffer.str(stream << static_cast<std::streambuf*>(nullptr)), "");
}

struct Grouping : std::numpunct<char> {
    char do_thousands_sep() const override { return '.'; }
    std::string do_grouping() const override { return "\3"; }
};

TEST(MessageBuffer, PrintsNumbersTheSameInEveryLocale) {
    const std::locale former =
        std::locale::global(std::locale(std::locale::classic(), new Grouping));
    std::deque<ZBMessageBuffer> buffers(40);
    for (ZBMessageBuffer& buffer : buffers) {
        std::ostream& stream = buffer;
        EXPECT_EQ(buffer.str(stream << 1234567), "1234567");
        stream.imbue(std::locale());
        EXPECT_EQ(buffer.str(stream << 1234567), "1.234.567");
        EXPECT_EQ(buffer.str(stream << 1234567), "1234567");
    }
    std::locale::global(former);
}

TEST(MessageBuffer, NestsDeeperThanBuffersAreKept) {
    std::deque<ZBMessageBuffer> buffers(100);
    for (std::size_t index = 0; index < buffers.size(); ++index) {
        static_cast<std::ostream&>(buffers[index]) << "buffer " << index;
    }
    for (std::size_t index = 0; index < buffers.size(); ++index) {
        EXPECT_EQ(buffers[index].str(buffers[index]), "buffer " + std::to_string(index));
    }
}

std::atomic<int> living{0};

struct Counted {
    Counted() { ++living; }
    ~Counted() { --living; }
    std::atomic<bool> inUse{false};
};

using Pool = ZBLog::ObjectPool<Counted, 4>;

TEST(ObjectPool, KeepsAsManyAsItHasPlacesAndNothingAfterItsEnd) {
    Pool pool;
    EXPECT_EQ(pool.take(), nullptr);
    auto object = std::make_unique<Counted>();
    const Counted* const address = object.get();
    pool.give(std::move(object));
    EXPECT_EQ(pool.take().get(), address);
    EXPECT_EQ(pool.take(), nullptr);
    for (int count = 0; count < 10; ++count) pool.give(std::make_unique<Counted>());
    EXPECT_EQ(living, 4);
    pool.close();
    EXPECT_EQ(living, 0);
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
