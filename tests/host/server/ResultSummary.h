#ifndef TESTS_HOST_SERVER_RESULT_SUMMARY_H
#define TESTS_HOST_SERVER_RESULT_SUMMARY_H

#include <string>
#include <vector>

namespace cmpihost::server::fixture {

/// The objects that a response holds, each as "Class(last key)" or, of an association, as
/// "Class(one end, other end)"; a class as "Class". The one line "4: DESCRIPTION" for an error.
std::vector<std::string> objectsIn(const std::string& response);

/// The value of a PARAMVALUE of the response; "none" where there is none.
std::string valueOf(const std::string& response, const std::string& parameter);

}  // namespace cmpihost::server::fixture

#endif
