// Statuses bear the names of the CIM standard, because those are what manuals and search engines
// know.
#include "host/cli/Diagnostics.h"

#include <algorithm>

#include "base/Utf8.h"

namespace cmpihost {

namespace {

struct StatusRow {
    CMPIrc rc;
    const char* name;
};

constexpr StatusRow statuses[] = {
    {CMPI_RC_OK, "CIM_ERR_SUCCESS"},
    {CMPI_RC_ERR_FAILED, "CIM_ERR_FAILED"},
    {CMPI_RC_ERR_ACCESS_DENIED, "CIM_ERR_ACCESS_DENIED"},
    {CMPI_RC_ERR_INVALID_NAMESPACE, "CIM_ERR_INVALID_NAMESPACE"},
    {CMPI_RC_ERR_INVALID_PARAMETER, "CIM_ERR_INVALID_PARAMETER"},
    {CMPI_RC_ERR_INVALID_CLASS, "CIM_ERR_INVALID_CLASS"},
    {CMPI_RC_ERR_NOT_FOUND, "CIM_ERR_NOT_FOUND"},
    {CMPI_RC_ERR_NOT_SUPPORTED, "CIM_ERR_NOT_SUPPORTED"},
    {CMPI_RC_ERR_CLASS_HAS_CHILDREN, "CIM_ERR_CLASS_HAS_CHILDREN"},
    {CMPI_RC_ERR_CLASS_HAS_INSTANCES, "CIM_ERR_CLASS_HAS_INSTANCES"},
    {CMPI_RC_ERR_INVALID_SUPERCLASS, "CIM_ERR_INVALID_SUPERCLASS"},
    {CMPI_RC_ERR_ALREADY_EXISTS, "CIM_ERR_ALREADY_EXISTS"},
    {CMPI_RC_ERR_NO_SUCH_PROPERTY, "CIM_ERR_NO_SUCH_PROPERTY"},
    {CMPI_RC_ERR_TYPE_MISMATCH, "CIM_ERR_TYPE_MISMATCH"},
    {CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, "CIM_ERR_QUERY_LANGUAGE_NOT_SUPPORTED"},
    {CMPI_RC_ERR_INVALID_QUERY, "CIM_ERR_INVALID_QUERY"},
    {CMPI_RC_ERR_METHOD_NOT_AVAILABLE, "CIM_ERR_METHOD_NOT_AVAILABLE"},
    {CMPI_RC_ERR_METHOD_NOT_FOUND, "CIM_ERR_METHOD_NOT_FOUND"},
    {CMPI_RC_DO_NOT_UNLOAD, "CMPI_RC_DO_NOT_UNLOAD"},
    {CMPI_RC_NEVER_UNLOAD, "CMPI_RC_NEVER_UNLOAD"},
    {CMPI_RC_ERR_INVALID_HANDLE, "CMPI_RC_ERR_INVALID_HANDLE"},
    {CMPI_RC_ERR_INVALID_DATA_TYPE, "CMPI_RC_ERR_INVALID_DATA_TYPE"},
    {CMPI_RC_ERROR_SYSTEM, "CMPI_RC_ERROR_SYSTEM"},
    {CMPI_RC_ERROR, "CMPI_RC_ERROR"},
};

}  // namespace

std::string messageLines(const std::string& text) {
    std::string lines;
    for (std::size_t start = 0; start < text.size();) {
        const std::size_t end = std::min(text.find('\n', start), text.size());
        lines += "cmpihost: " + text.substr(start, end - start) + "\n";
        start = end + 1;
    }
    return lines;
}

std::string noteLine(const std::string& text) {
    return messageLines("note: " + text);
}

std::string statusText(CMPIrc rc) {
    const std::string number = std::to_string(static_cast<unsigned>(rc));
    for (const StatusRow& row : statuses) {
        if (row.rc == rc) return std::string(row.name) + " (" + number + ")";
    }
    return "CMPI status " + number;
}

std::string requestText(const OperationRequest& request) {
    const ObjectPathValue& path = request.path;
    std::string text = operationName(request.operation);
    if (!request.method.empty()) text += " " + base::escapeForTerminal(request.method);
    if (!path.className.empty()) text += " of " + base::escapeForTerminal(path.className);
    return text + " in " + base::escapeForTerminal(path.nameSpace);
}

std::string failureText(const OperationRequest& request, const OperationResult& result) {
    const std::string message = base::escapeForTerminal(result.message.value_or(std::string()));
    return requestText(request) + ": " + statusText(result.rc) +
           (message.empty() ? "" : ": " + message);
}

}  // namespace cmpihost
