#ifndef TESTS_HOST_SERVER_RESPONSE_VALIDATOR_H
#define TESTS_HOST_SERVER_RESPONSE_VALIDATOR_H

#include <string>
#include <vector>

/// Judges response documents by what clients read of CIM-XML, without any code of the endpoint:
/// the form that the weakest of them need, the grammar of elements, the forms of values, and what
/// each operation may answer. Any thread may call these.
namespace cmpihost::server {

/// What is wrong with a response: a line for each fault, none for a good one.
std::vector<std::string> complaintsAbout(const std::string& document);

/// The same for the response to an operation or method, whose name it has to repeat exactly.
std::vector<std::string> complaintsAbout(const std::string& document,
                                         const std::string& operationName);

}  // namespace cmpihost::server

#endif
