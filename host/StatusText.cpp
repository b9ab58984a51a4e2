#include "host/StatusText.h"

#include "host/TerminalText.h"

namespace cmpihost {

namespace {

struct StatusRow {
    unsigned rc;
    const char* name;
};

constexpr StatusRow statuses[] = {
    {0, "CIM_ERR_SUCCESS"},
    {1, "CIM_ERR_FAILED"},
    {2, "CIM_ERR_ACCESS_DENIED"},
    {3, "CIM_ERR_INVALID_NAMESPACE"},
    {4, "CIM_ERR_INVALID_PARAMETER"},
    {5, "CIM_ERR_INVALID_CLASS"},
    {6, "CIM_ERR_NOT_FOUND"},
    {7, "CIM_ERR_NOT_SUPPORTED"},
    {8, "CIM_ERR_CLASS_HAS_CHILDREN"},
    {9, "CIM_ERR_CLASS_HAS_INSTANCES"},
    {10, "CIM_ERR_INVALID_SUPERCLASS"},
    {11, "CIM_ERR_ALREADY_EXISTS"},
    {12, "CIM_ERR_NO_SUCH_PROPERTY"},
    {13, "CIM_ERR_TYPE_MISMATCH"},
    {14, "CIM_ERR_QUERY_LANGUAGE_NOT_SUPPORTED"},
    {15, "CIM_ERR_INVALID_QUERY"},
    {16, "CIM_ERR_METHOD_NOT_AVAILABLE"},
    {17, "CIM_ERR_METHOD_NOT_FOUND"},
    {50, "CMPI_RC_DO_NOT_UNLOAD"},
    {51, "CMPI_RC_NEVER_UNLOAD"},
    {60, "CMPI_RC_ERR_INVALID_HANDLE"},
    {61, "CMPI_RC_ERR_INVALID_DATA_TYPE"},
    {100, "CMPI_RC_ERROR_SYSTEM"},
    {200, "CMPI_RC_ERROR"},
};

}  // namespace

std::string statusText(CMPIrc rc) {
    const auto number = static_cast<unsigned>(rc);
    for (const StatusRow& row : statuses) {
        if (row.rc == number) {
            return std::string(row.name) + " (" + std::to_string(number) + ")";
        }
    }
    return "CMPI status " + std::to_string(number);
}

std::string failureText(const OperationResult& result) {
    const std::string message = terminalText(result.message.value_or(std::string()));
    return statusText(result.rc) + (message.empty() ? "" : ": " + message);
}

}  // namespace cmpihost
