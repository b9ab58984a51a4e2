#ifndef HOST_SERVER_MESSAGE_H
#define HOST_SERVER_MESSAGE_H

#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "host/server/RequestPath.h"
#include "host/server/XmlTree.h"

/// CIM-XML request messages.
namespace cmpihost::server {

/// A text that is no request message that is understood here. what() says why, in ASCII and
/// without control characters.
class MessageError : public std::runtime_error {
  public:
    /// `cimError` is a word for the header CIMError, with static storage; null for none.
    MessageError(unsigned httpStatus, const char* cimError, const std::string& detail)
        : std::runtime_error(detail), httpStatus_(httpStatus), cimError_(cimError) {}

    unsigned httpStatus() const noexcept { return httpStatus_; }
    const char* cimError() const noexcept { return cimError_; }

  private:
    unsigned httpStatus_;
    const char* cimError_;
};

/// A parameter as it was sent: an IPARAMVALUE or a PARAMVALUE.
struct MessageParameter {
    std::string name{};
    /// PARAMTYPE; empty: not told.
    std::string type{};
    /// What is in it; absent: NULL.
    std::optional<XmlElement> value{};
};

/// One call of an operation or method. Names are as the client spelled them.
struct Message {
    std::string id{};
    std::string protocolVersion{};
    /// IMETHODCALL; else METHODCALL.
    bool intrinsic = true;
    std::string method{};
    /// "root/cimv2": without slashes at its ends or double ones.
    std::string nameSpace{};
    /// Of a METHODCALL: the class or instance that has the method.
    RequestPath object{};
    std::vector<MessageParameter> parameters{};
};

/// Reads the body of a request. Throws MessageError with the HTTP status and the word of CIMError
/// that tell clients what is wrong with it. Any thread may call it.
Message readMessage(std::string_view body);

}  // namespace cmpihost::server

#endif
