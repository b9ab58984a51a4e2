// The library is loaded as it ships, so that what is tested is what an object manager gets.
#include "library/LibraryFixture.h"

#include "framework/instrumentation/HostSource.h"

using namespace cmpihost;

const char* const providerFile = KORVA_BINARY_DIR "/lib/libkorzbosstatusprofileprovider.so.1";

std::vector<std::string> texts(const std::vector<ObjectPathValue>& paths) {
    std::vector<std::string> result;
    for (const ObjectPathValue& each : paths) result.push_back(toString(each));
    return result;
}

std::vector<std::string> texts(const std::vector<InstanceValue>& instances) {
    std::vector<std::string> result;
    for (const InstanceValue& each : instances) result.push_back(toString(each.path));
    return result;
}

std::string text(const InstanceValue& instance, const std::string& property) {
    const Value* value = instance.property(property);
    return value == nullptr ? "(absent)" : value->toText();
}

std::vector<NamedRequest> oneRequestOfEachHandler() {
    std::vector<NamedRequest> chosen;
    for (const NamedRequest& each : servedRequests({"host1", "Linux", "Linux"}))
        for (const char* suffix :
             {"NamesOfOperatingSystem", "InstancesOfOperatingSystem", "InstanceOfOperatingSystem",
              "OfCapabilitiesThroughOSElementCapabilities"})
            if (testing::Value(each.name, testing::EndsWith(suffix))) chosen.push_back(each);
    return chosen;
}

LibraryFixture::LibraryFixture(BrokerOptions options)
    : host(std::make_shared<VA::SimulatedHost>()),
      broker(&schemaCatalogue(), options),
      library(providerFile, broker) {
    VA::SimulatedHost::Node node = VA::SimulatedHost::plausibleNode();
    node.properties[VA::NodeLexicon::Name] = std::string("Linux");
    host->addNode(node);
    host->setComputerName("host1");
    VA::setHostSource(host);
    broker.route(ComputerSystemService::className, computers);
    recording::setRecording(true);
    recording::clear();
}

LibraryFixture::~LibraryFixture() {
    VA::setHostSource(nullptr);
    recording::setHook({});
    recording::clear();
}

void LibraryFixture::TearDown() {
    EXPECT_THAT(broker.takeViolations(), testing::IsEmpty());
}

Outcome LibraryFixture::invoke(const OperationRequest& request, const CollectorSetup& setup) {
    return cmpihost::invoke(library, broker, request, setup);
}

Outcome LibraryFixture::enumerateNames(const std::string& className) {
    return invoke(requestFor(Operation::EnumerateInstanceNames, path(className)));
}

Outcome LibraryFixture::enumerate(const std::string& className) {
    return invoke(requestFor(Operation::EnumerateInstances, path(className)));
}

Outcome LibraryFixture::get(const ObjectPathValue& instance) {
    return invoke(requestFor(Operation::GetInstance, instance));
}

Outcome LibraryFixture::associatorNames(const ObjectPathValue& source,
                                        std::optional<std::string> assocClass) {
    OperationRequest request = requestFor(Operation::AssociatorNames, source);
    request.assocClass = std::move(assocClass);
    return invoke(request);
}

Outcome LibraryFixture::associators(const ObjectPathValue& source,
                                    std::optional<std::string> assocClass) {
    OperationRequest request = requestFor(Operation::Associators, source);
    request.assocClass = std::move(assocClass);
    return invoke(request);
}

void expectDone(const Outcome& outcome) {
    EXPECT_EQ(outcome.rc, CMPI_RC_OK);
    EXPECT_FALSE(outcome.message.has_value());
    EXPECT_EQ(outcome.doneCount, 1U);
}

void LibraryFixture::setNodes(const std::vector<std::string>& names) {
    host->clearNodes();
    for (const std::string& name : names) {
        VA::SimulatedHost::Node node;
        node.properties[VA::NodeLexicon::Name] = name;
        host->addNode(node);
    }
}
