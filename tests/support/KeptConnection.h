#ifndef TESTS_SUPPORT_KEPT_CONNECTION_H
#define TESTS_SUPPORT_KEPT_CONNECTION_H

#include <cstdint>
#include <string>
#include <string_view>

#include "base/FileDescriptor.h"

/// A client of a WBEM endpoint that costs next to nothing: for load and for measurements.

/// An intrinsic operation in root/cimv2 as a whole HTTP request; `parameters` is XML.
std::string intrinsicRequest(const std::string& id, const std::string& operation,
                             const std::string& parameters);

/// IPARAMVALUE with a CLASSNAME, or with a VALUE.
std::string classParameter(const std::string& name, const std::string& className);
std::string valueParameter(const std::string& name, const std::string& value);

/// One connection for many requests. One thread uses it.
class KeptConnection {
  public:
    /// Connects to a port of 127.0.0.1, from 127.0.0.<source>. This and ask() throw
    /// std::runtime_error, ask() also when the answer takes more than ten seconds or has another
    /// status than 200.
    explicit KeptConnection(std::uint16_t port, unsigned source = 1);

    /// Sends a request and gives the body of the answer, valid until the next call.
    std::string_view ask(const std::string& request);

  private:
    void receive();

    base::FileDescriptor socket_;
    std::string buffer_;
    std::size_t filled_ = 0;
};

#endif
