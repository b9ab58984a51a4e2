#include "support/KeptConnection.h"

#include <arpa/inet.h>
#include <netinet/tcp.h>
#include <sys/socket.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <stdexcept>

namespace {

sockaddr_in loopback(unsigned host, std::uint16_t port) {
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl((INADDR_LOOPBACK & 0xffffff00U) + host);
    address.sin_port = htons(port);
    return address;
}

[[noreturn]] void fail(const std::string& what) {
    throw std::runtime_error(what + ": " + std::strerror(errno));
}

}  // namespace

std::string intrinsicRequest(const std::string& id, const std::string& operation,
                             const std::string& parameters) {
    const std::string body =
        "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n"
        "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"" +
        id + "\" PROTOCOLVERSION=\"1.0\"><SIMPLEREQ><IMETHODCALL NAME=\"" + operation +
        "\"><LOCALNAMESPACEPATH><NAMESPACE NAME=\"root\"/><NAMESPACE NAME=\"cimv2\"/>"
        "</LOCALNAMESPACEPATH>" +
        parameters + "</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>\n";
    return "POST /cimom HTTP/1.1\r\nHost: 127.0.0.1\r\n"
           "Content-Type: application/xml; charset=\"utf-8\"\r\nCIMOperation: MethodCall\r\n"
           "CIMMethod: " +
           operation +
           "\r\nCIMObject: root/cimv2\r\nContent-Length: " + std::to_string(body.size()) +
           "\r\n\r\n" + body;
}

std::string classParameter(const std::string& name, const std::string& className) {
    return "<IPARAMVALUE NAME=\"" + name + "\"><CLASSNAME NAME=\"" + className +
           "\"/></IPARAMVALUE>";
}

std::string valueParameter(const std::string& name, const std::string& value) {
    return "<IPARAMVALUE NAME=\"" + name + "\"><VALUE>" + value + "</VALUE></IPARAMVALUE>";
}

KeptConnection::KeptConnection(std::uint16_t port, unsigned source)
    : socket_(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0)), buffer_(65536, '\0') {
    const sockaddr_in from = loopback(source, 0);
    const sockaddr_in to = loopback(1, port);
    const int one = 1;
    const timeval patience = {10, 0};
    ::setsockopt(socket_.number(), IPPROTO_TCP, TCP_NODELAY, &one, sizeof one);
    ::setsockopt(socket_.number(), SOL_SOCKET, SO_RCVTIMEO, &patience, sizeof patience);
    if (::bind(socket_.number(), reinterpret_cast<const sockaddr*>(&from), sizeof from) != 0 ||
        ::connect(socket_.number(), reinterpret_cast<const sockaddr*>(&to), sizeof to) != 0)
        fail("cannot connect");
}

std::string_view KeptConnection::ask(const std::string& request) {
    if (::send(socket_.number(), request.data(), request.size(), MSG_NOSIGNAL) !=
        static_cast<ssize_t>(request.size()))
        fail("cannot send");
    filled_ = 0;
    std::size_t body = std::string::npos;
    while (body == std::string::npos) {
        receive();
        body = std::string_view(buffer_.data(), filled_).find("\r\n\r\n");
    }
    const std::string_view head(buffer_.data(), body);
    const std::string_view name = "\r\nContent-Length: ";
    const std::size_t length = head.find(name);
    if (head.substr(0, 13) != "HTTP/1.1 200 " || length == std::string::npos)
        throw std::runtime_error("unexpected answer: " + std::string(buffer_.data(), filled_));
    const std::size_t size = std::strtoul(head.data() + length + name.size(), nullptr, 10);
    body += 4;
    if (body + size > buffer_.size()) buffer_.resize(body + size);
    while (filled_ < body + size) receive();
    if (filled_ > body + size) throw std::runtime_error("more than an answer");
    return {buffer_.data() + body, size};
}

void KeptConnection::receive() {
    const ssize_t count =
        ::recv(socket_.number(), buffer_.data() + filled_, buffer_.size() - filled_, 0);
    if (count == 0) throw std::runtime_error("the endpoint closed the connection");
    if (count < 0) fail("cannot receive");
    filled_ += static_cast<std::size_t>(count);
}
