#include "host/server/Dispatcher.h"

#include <gmock/gmock.h>

#include "host/server/ServerFixture.h"

namespace cmpihost::server {
namespace {

using namespace fixture;

TEST(Dispatcher, TellsAnUnknownNamespaceBeforeAnUnknownOperation) {
    EXPECT_EQ(error(respond(operation("Nonsense", "", "root/nope"))),
              "3: root/nope: no such namespace");
    EXPECT_EQ(error(respond(operation("Nonsense"))), "7: Nonsense: there is no such operation");
}

}  // namespace
}  // namespace cmpihost::server
