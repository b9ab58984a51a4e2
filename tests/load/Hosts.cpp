// Chooses the host that the instrumentation shows. A library of its own, so that the soak can take
// the instrumentation out of its process together with the provider.
#include <memory>
#include <string>

#include "support/SimulatedHost.h"

namespace {

// The host's code goes with this library: the instrumentation must not keep a host longer.
struct Restore {
    ~Restore() { VA::setHostSource(nullptr); }
} restore;

}  // namespace

extern "C" [[gnu::visibility("default")]] void showNodes(unsigned int count);

// `count` nodes "os1", "os2" … on a computer "host1".
void showNodes(unsigned int count) {
    const auto host = std::make_shared<VA::SimulatedHost>();
    host->setComputerName("host1");
    for (unsigned int number = 1; number <= count; ++number) {
        VA::SimulatedHost::Node node = VA::SimulatedHost::plausibleNode();
        node.properties[VA::NodeLexicon::Name] = "os" + std::to_string(number);
        host->addNode(node);
    }
    VA::setHostSource(host);
}
