#ifndef TESTS_PROVIDER_ADAPTER_FIXTURE_H
#define TESTS_PROVIDER_ADAPTER_FIXTURE_H

#include <string>
#include <utility>
#include <vector>

#include "host/broker/RequestScope.h"
#include "provider/SimulatedFixture.h"
#include "support/ComputerSystemService.h"

template <class Adapter>
bool stands(Adapter& adapter) {
    return static_cast<bool>(adapter);
}

/// The adapters on their own, within one request of a broker that serves one computer system, on a
/// host with the nodes "a" and "b".
class Adapters : public SimulatedFixture {
  protected:
    using Keys = std::vector<cmpihost::KeyBinding>;

    Adapters() {
        broker.route(cmpihost::ComputerSystemService::className, computers);
        addNode("a");
        addNode("b");
    }

    void TearDown() override { EXPECT_EQ(broker.takeViolations(), std::vector<std::string>{}); }

    CMPIObjectPath* made(const std::string& className, Keys keys = {}) {
        return request.makePath({"root/cimv2", className, std::move(keys)});
    }

    // A path as text, "(none)" for null.
    static std::string textOf(const CMPIObjectPath* path) {
        return path == nullptr ? "(none)" : cmpihost::toString(cmpihost::valueOf(path));
    }

    // A property as text, "(absent)" when the instance has none of that name.
    static std::string text(const cmpihost::InstanceValue& instance, const char* name) {
        const cmpihost::Value* found = instance.property(name);
        return found == nullptr ? "(absent)" : found->toText();
    }

    // The named key of a path, "(none)" for null, "(absent)" for a path without it.
    static std::string key(const CMPIObjectPath* path, const char* name) {
        if (path == nullptr) return "(none)";
        const cmpihost::ObjectPathValue value = cmpihost::valueOf(path);
        const cmpihost::Value* found = value.key(name);
        return found == nullptr ? "(absent)" : found->toText();
    }

    cmpihost::ComputerSystemService computers{"host1"};
    cmpihost::Broker broker;
    cmpihost::RequestScope request{broker};
    CMPIContext* context = request.makeContext({}, "root/cimv2");
};

#endif
