#include "framework/instrumentation/Linux/Systemd.h"

#include <gtest/gtest.h>

#include "tests/instrumentation/HostParts.h"

namespace {

using VA::Linux::nodeStatusOf;

TEST(SystemState, HasANodeStatusEach) {
    EXPECT_EQ(nodeStatusOf("running"), 1u);
    EXPECT_EQ(nodeStatusOf("initializing"), 2u);
    EXPECT_EQ(nodeStatusOf("starting"), 2u);
    EXPECT_EQ(nodeStatusOf("degraded"), 21u);
    EXPECT_EQ(nodeStatusOf("maintenance"), 8u);
    EXPECT_EQ(nodeStatusOf("stopping"), 16u);
    EXPECT_EQ(nodeStatusOf("offline"), 12u);
}

TEST(SystemState, ThatIsNotListedIsUnknown) {
    for (const char* state : {"", "unknown", "Running", "running ", "run", "degraded2"}) {
        EXPECT_EQ(nodeStatusOf(state), 0u) << state;
    }
}

TEST(SystemState, ThatNobodyTellsIsUnknown) {
    FixtureHost host;
    host.tree().makeFolder("run/systemd/system");
    host.manager->state = std::nullopt;
    EXPECT_EQ(host.cursor()->nodeStatus(), 0u);
}

TEST(SystemState, IsAskedForOnHostsThatRunSystemdOnly) {
    FixtureHost host;
    host.manager->state = "offline";
    EXPECT_EQ(host.cursor()->nodeStatus(), 1u);
    EXPECT_EQ(host.manager->calls, 0);
    host.tree().makeFolder("run/systemd/system");
    EXPECT_EQ(host.cursor()->nodeStatus(), 12u);
    EXPECT_EQ(host.manager->calls, 1);
}

}  // namespace
