#ifndef TESTS_HOST_SERVER_SERVER_FIXTURE_H
#define TESTS_HOST_SERVER_SERVER_FIXTURE_H

#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "host/server/ObjectManager.h"

/// Object managers in the test program, and requests for them.
namespace cmpihost::server::fixture {

/// Object managers over real providers. Providers have one broker in a process, so there is one
/// object manager at a time: it lives until one of these functions is asked for another. All of
/// them are named "server.example" and see the fixture host, "fixture.example".
///
/// The one over the shipped libraries, with the schema and the registrations of the source tree.
ObjectManager& shippedManager();
/// The one over the providers of tests/host/providers, in root/test and root/other; a new one with
/// more sections of registrations, or more MOF.
ObjectManager& foreignManager(const std::string& registrations = {}, const std::string& mof = {});
/// A new one, with registrations from a text and with libraries from the folder of the build. Its
/// schema is a file or folder of the source tree, or as given.
ObjectManager& newManager(const std::string& schema, const std::string& registrations);
ObjectManager& newManager(Schema schema, const std::string& registrations);
Schema schemaOf(const std::string& mof);
/// A section of a registration file.
std::string registration(const std::string& className, const std::string& provider,
                         const std::string& location, const std::string& types,
                         const std::string& nameSpaces = "root/cimv2");

/// The response document that a manager answers to the text of a request message; "HTTP 400: why"
/// for one that is no message. A response that clients would not read fails the test. The first
/// form asks shippedManager().
std::string respond(const std::string& request);
std::string respond(ObjectManager& manager, const std::string& request,
                    const std::optional<std::string>& user = {});

/// A request message of an intrinsic operation; `parameters` is XML. Namespaces are as
/// "root/cimv2".
std::string operation(const std::string& name, const std::string& parameters = {},
                      const std::string& nameSpace = "root/cimv2");
/// Of a method; `object` is a CLASSNAME or an INSTANCENAME.
std::string methodCall(const std::string& name, const std::string& object,
                       const std::string& parameters = {},
                       const std::string& nameSpace = "root/cimv2");

/// Elements of requests. Values are put in as they are, so they are XML.
std::string parameter(const std::string& name, const std::string& content);
std::string className(const std::string& parameterName, const std::string& name);
std::string value(const std::string& parameterName, const std::string& text);
std::string list(const std::string& parameterName, const std::vector<std::string>& names);
/// An INSTANCENAME with string keys.
std::string instanceName(const std::string& name,
                         const std::vector<std::pair<std::string, std::string>>& keys);
/// The INSTANCENAMEs of the instances of the fixture host.
std::string operatingSystem();
std::string computerSystem();
std::string capabilities();

/// The content of IMETHODRESPONSE or METHODRESPONSE; the whole document where there is neither.
std::string content(const std::string& document);
/// "6: DESCRIPTION" of an answer with an ERROR; empty for one without.
std::string error(const std::string& document);
/// How often a text stands in another.
std::size_t count(const std::string& text, const std::string& part);

}  // namespace cmpihost::server::fixture

#endif
