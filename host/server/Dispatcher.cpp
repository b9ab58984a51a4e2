// The order of the tests is what clients draw conclusions from: the namespace, then the operation,
// then its parameters.
#include "host/server/Dispatcher.h"

#include <new>

#include "host/server/CimError.h"
#include "host/server/Operations.h"
#include "host/server/ResponseWriter.h"

namespace cmpihost::server {

namespace {

/// Appends what stands in the response's element; throws CimError.
void carryOut(ObjectManager& manager, const Message& message,
              const std::optional<std::string>& user, std::string& xml) {
    const std::string nameSpace = manager.nameSpace(message.nameSpace);
    if (!message.intrinsic) {
        invokeMethod(manager, nameSpace, message, user, xml);
        return;
    }
    const OperationRow* const row = findOperation(message.method);
    if (row == nullptr)
        throw CimError(cimNotSupported, message.method + ": there is no such operation");
    const Parameters parameters(row->parameters, message);
    row->run({manager, nameSpace, parameters, user}, xml);
}

Response responseTo(ObjectManager& manager, const Message& message,
                    const std::optional<std::string>& user) {
    try {
        Response response;
        beginResponse(response.document, message);
        carryOut(manager, message, user, response.document);
        endResponse(response.document, message);
        return response;
    } catch (const CimError& error) {
        return {errorResponse(message, error.code(), error.what()), error.code()};
    } catch (const std::bad_alloc&) {
        throw;
    } catch (const std::exception& error) {
        manager.complain(message.method + ": " + error.what());
        return {errorResponse(message, cimFailed, message.method + " failed in the server"),
                cimFailed};
    }
}

}  // namespace

Response answer(ObjectManager& manager, const Message& message,
                const std::optional<std::string>& user) {
    const auto start = Statistics::Clock::now();
    Response response = responseTo(manager, message, user);
    manager.statistics().countOperation(Statistics::Clock::now() - start, response.code != 0);
    return response;
}

}  // namespace cmpihost::server
