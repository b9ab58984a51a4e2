// Many clients of the endpoint in this process, so that the sanitizers see all of it: answers must
// not mix, whoever comes and goes meanwhile.
#include <arpa/inet.h>
#include <gtest/gtest.h>
#include <sys/socket.h>

#include <atomic>
#include <thread>

#include "framework/instrumentation/HostSource.h"
#include "host/InstallPaths.h"
#include "host/server/CimOverHttp.h"
#include "host/server/HttpServer.h"
#include "load/EndpointClients.h"
#include "support/KeptConnection.h"
#include "support/SimulatedHost.h"

namespace {

namespace server = cmpihost::server;

class EverybodyMayAsk final : public server::AccessControl {
  public:
    Verdict judge(const server::HttpRequest&) override { return {true, std::nullopt}; }
};

/// The shipped providers on a simulated host.
server::ObjectManagerSetup shippedSetup() {
    const std::filesystem::path programs = KORVA_BINARY_DIR "/bin";
    server::ObjectManagerSetup setup;
    setup.schema = cmpihost::Schema::load({cmpihost::schemaFolder(programs)});
    setup.registrations = cmpihost::Registrations::read({cmpihost::registrationFolder(programs)});
    setup.libraryFolders = cmpihost::libraryFolders(programs);
    setup.hostName = "simulated.example";
    return setup;
}

base::FileDescriptor listeningSocket() {
    base::FileDescriptor socket(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    ::bind(socket.number(), reinterpret_cast<const sockaddr*>(&address), sizeof address);
    ::listen(socket.number(), 64);
    return socket;
}

std::uint16_t portOf(const base::FileDescriptor& socket) {
    sockaddr_in address{};
    socklen_t size = sizeof address;
    ::getsockname(socket.number(), reinterpret_cast<sockaddr*>(&address), &size);
    return ntohs(address.sin_port);
}

TEST(EndpointUnderLoad, GivesEachClientTheAnswersToItsOwnRequestsWhileOthersComeAndGo) {
    VA::setHostSource(VA::SimulatedHost::withOneNode());
    {
        server::ObjectManager manager(shippedSetup());
        EverybodyMayAsk everybody;
        server::CimOverHttp handler(manager, everybody, {{"localhost"}, 32});
        base::FileDescriptor listener = listeningSocket();
        const std::uint16_t port = portOf(listener);
        auto first = std::make_unique<server::HttpServer>(std::move(listener), handler,
                                                          server::HttpLimits{});
        EndpointClients clients(port, 8, "simulated.example", "Simulated Linux");
        std::atomic<bool> ended{false};
        std::thread others([&] {
            const std::string request = intrinsicRequest("1", "EnumerateInstances",
                                                         classParameter("ClassName", "CIM_System"));
            while (!ended) {
                KeptConnection(port, 9).ask(request);
                const KeptConnection leavesAtOnce(port, 9);
                static_cast<void>(manager.statistics().operations());
            }
        });
        EXPECT_NO_THROW(clients.run(400));
        // The next server takes over while the connections of the first one go on.
        const server::HttpServer second(first->stopListening(), handler, server::HttpLimits{});
        EXPECT_NO_THROW(clients.run(80));
        ended = true;
        others.join();
        first.reset();
        EXPECT_GE(manager.statistics().operations(), 480U);
        EXPECT_EQ(manager.takeComplaints(), std::vector<std::string>());
    }
    VA::setHostSource(nullptr);
}

}  // namespace
