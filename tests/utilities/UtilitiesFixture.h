#ifndef TESTS_UTILITIES_UTILITIES_FIXTURE_H
#define TESTS_UTILITIES_UTILITIES_FIXTURE_H

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "ProviderUtilities.h"
#include "host/broker/Broker.h"
#include "host/broker/Request.h"

/// An open request of a broker; the parameter says whether it is one with everything that may be
/// missing missing.
class UtilitiesFixture : public testing::TestWithParam<bool> {
  protected:
    using Utilities = VA::ProviderUtilities;

    UtilitiesFixture()
        : broker(nullptr,
                 GetParam() ? cmpihost::BrokerOptions::sparse() : cmpihost::BrokerOptions{}) {}

    void TearDown() override { EXPECT_THAT(broker.takeViolations(), testing::IsEmpty()); }

    CMPIObjectPath* path(const std::string& className,
                         std::vector<cmpihost::KeyBinding> keys = {}) {
        cmpihost::ObjectPathValue value;
        value.nameSpace = "root/cimv2";
        value.className = className;
        value.keys = std::move(keys);
        return request.makePath(value);
    }

    cmpihost::Broker broker;
    cmpihost::Request request{broker};
};

inline std::string brokerName(const testing::TestParamInfo<bool>& info) {
    return info.param ? "SparseBroker" : "CompleteBroker";
}

#endif
