#ifndef TESTS_LOAD_ENDPOINT_CLIENTS_H
#define TESTS_LOAD_ENDPOINT_CLIENTS_H

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

/// Clients of an endpoint, each with a kept connection and identifiers of its own, that ask a
/// mixture of operations of the operating system of a host. Each answer must be the one that its
/// request had before anything else ran, but for the identifier. One thread uses it.
class EndpointClients {
  public:
    /// Connects them. `computer` and `system` are the names in the keys of the operating system.
    /// This and run() throw std::runtime_error, with the answer that is not as it must be.
    EndpointClients(std::uint16_t port, unsigned long connections, const std::string& computer,
                    const std::string& system);
    ~EndpointClients();

    /// All at once ask that many times, in sum.
    void run(unsigned long requests);

  private:
    class Client;
    /// An operation by its name, its parameters, and the answer to the identifier "0".
    struct Kind {
        std::string operation;
        std::string parameters;
        std::string answer;
    };

    const std::string source_;
    std::vector<Kind> kinds_;
    std::vector<std::unique_ptr<Client>> clients_;
};

#endif
