#ifndef TESTS_FAULTS_REQUESTS_H
#define TESTS_FAULTS_REQUESTS_H

#include <ostream>
#include <string>
#include <vector>

#include "host/broker/Operation.h"

/// A request, and what is due for it on a host and a broker without faults.
struct NamedRequest {
    std::string name;     ///< of the request, unique, letters and digits
    std::string handler;  ///< the provider's function that answers it
    cmpihost::OperationRequest request;
    std::string message;  ///< of the exception that ends it; empty: none
};

std::ostream& operator<<(std::ostream& out, const NamedRequest& request);

/// The requests that the provider serves: each operation on each class, and each association from
/// each kind of source.
const std::vector<NamedRequest>& servedRequests();

/// The names of their handlers, each once.
const std::vector<std::string>& servingHandlers();

/// The requests for the facade: those that the provider serves or refuses, and those that it alone
/// answers; and the names of its handlers. Their messages are empty.
const std::vector<NamedRequest>& facadeRequests();
const std::vector<std::string>& facadeHandlers();

/// The requests of a handler of the provider that serves, or of the facade.
std::vector<NamedRequest> requestsOf(const std::string& handler);

/// Those that it refuses by CMPI_RC_ERR_NOT_SUPPORTED: each operation on each class.
const std::vector<NamedRequest>& refusedRequests();

/// Those for a class that it does not serve.
const std::vector<NamedRequest>& strangeRequests();

#endif
