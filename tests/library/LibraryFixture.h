#ifndef TESTS_LIBRARY_LIBRARY_FIXTURE_H
#define TESTS_LIBRARY_LIBRARY_FIXTURE_H

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/broker/Invoke.h"
#include "support/ComputerSystemService.h"
#include "support/RecordingLog.h"
#include "support/Requests.h"
#include "support/SimulatedHost.h"

/// The file of the built provider.
extern const char* const providerFile;

/// Paths as text, in order; instances by their path.
std::vector<std::string> texts(const std::vector<cmpihost::ObjectPathValue>& paths);
std::vector<std::string> texts(const std::vector<cmpihost::InstanceValue>& instances);

/// A property as text, "(absent)" when the instance has none of that name.
std::string text(const cmpihost::InstanceValue& instance, const std::string& property);

/// Expects that a request was served: status, no message, and the end reported once.
void expectDone(const cmpihost::Outcome& outcome);

/// One request for each of the five handlers that serve, all of which meet the instrumentation.
std::vector<NamedRequest> oneRequestOfEachHandler();

/// The built provider, loaded as an object manager loads it, under a strict broker with the schema,
/// on a simulated host with one node "Linux" whose computer is called "host1". The broker serves
/// one computer system, "host1". What the broker catches fails the test.
class LibraryFixture : public testing::Test {
  protected:
    using Operation = cmpihost::Operation;

    explicit LibraryFixture(cmpihost::BrokerOptions options = {});
    ~LibraryFixture() override;
    void TearDown() override;

    cmpihost::Outcome invoke(const cmpihost::OperationRequest& request,
                             const cmpihost::CollectorSetup& setup = {});
    cmpihost::Outcome enumerateNames(const std::string& className);
    cmpihost::Outcome enumerate(const std::string& className);
    cmpihost::Outcome get(const cmpihost::ObjectPathValue& instance);
    cmpihost::Outcome associatorNames(const cmpihost::ObjectPathValue& source,
                                      std::optional<std::string> assocClass);
    cmpihost::Outcome associators(const cmpihost::ObjectPathValue& source,
                                  std::optional<std::string> assocClass);

    /// Replaces the host's nodes by nodes with these names and nothing else.
    void setNodes(const std::vector<std::string>& names);

    std::shared_ptr<VA::SimulatedHost> host;
    cmpihost::ComputerSystemService computers{"host1"};
    cmpihost::Broker broker;
    cmpihost::ProviderLibrary library;
};

#endif
