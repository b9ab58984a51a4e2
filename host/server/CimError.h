#ifndef HOST_SERVER_CIM_ERROR_H
#define HOST_SERVER_CIM_ERROR_H

#include <stdexcept>
#include <string>

namespace cmpihost::server {

/// The status codes of CIM operations.
enum CimStatus : unsigned {
    cimFailed = 1,
    cimAccessDenied = 2,
    cimInvalidNamespace = 3,
    cimInvalidParameter = 4,
    cimInvalidClass = 5,
    cimNotFound = 6,
    cimNotSupported = 7,
    cimAlreadyExists = 11,
    cimNoSuchProperty = 12,
    cimTypeMismatch = 13,
    cimQueryLanguageNotSupported = 14,
    cimInvalidQuery = 15,
    cimMethodNotAvailable = 16,
    cimMethodNotFound = 17,
    cimInvalidEnumerationContext = 21,
    cimInvalidOperationTimeout = 22,
    cimFilteredEnumerationNotSupported = 25,
    cimContinuationOnErrorNotSupported = 26,
    cimServerLimitsExceeded = 27
};

/// Ends an operation with a status other than OK. The text is one sentence for the client and may
/// hold any UTF-8 that the client sent; it is never empty.
class CimError : public std::runtime_error {
  public:
    CimError(unsigned code, const std::string& description)
        : std::runtime_error(description), code_(code) {}

    /// A CimStatus, or whatever else a provider answered.
    unsigned code() const noexcept { return code_; }

  private:
    unsigned code_;
};

/// What a status says of an operation whose provider leaves it without words. Any thread may call
/// it.
std::string wordsForStatus(unsigned code);

}  // namespace cmpihost::server

#endif
