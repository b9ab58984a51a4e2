#ifndef TESTS_PROVIDER_SIMULATED_FIXTURE_H
#define TESTS_PROVIDER_SIMULATED_FIXTURE_H

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <utility>

#include "framework/instrumentation/HostSource.h"
#include "support/RecordingLog.h"
#include "support/SimulatedHost.h"

/// A test on a simulated host that has no node yet and whose computer is called "Host1"; starts
/// without records.
class SimulatedFixture : public testing::Test {
  protected:
    SimulatedFixture() {
        host->setComputerName("Host1");
        VA::setHostSource(host);
        recording::clear();
    }
    ~SimulatedFixture() override {
        VA::setHostSource(nullptr);
        recording::setHook({});
        recording::clear();
    }

    /// Adds a node with nothing but a name.
    void addNode(const std::string& name) {
        VA::SimulatedHost::Node node;
        node.properties[VA::NodeLexicon::Name] = name;
        host->addNode(std::move(node));
    }

    /// Makes the one node of the host hold one property.
    void setProperty(VA::NodeLexicon::Properties id, VA::SimulatedHost::Value value) {
        VA::SimulatedHost::Node node;
        node.properties[id] = std::move(value);
        host->clearNodes();
        host->addNode(std::move(node));
    }

    std::shared_ptr<VA::SimulatedHost> host = std::make_shared<VA::SimulatedHost>();
};

#endif
