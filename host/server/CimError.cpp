#include "host/server/CimError.h"

namespace cmpihost::server {

namespace {

struct StatusWords {
    unsigned code;
    const char* words;
};

constexpr StatusWords statusWords[] = {
    {cimAccessDenied, "access is denied"},
    {cimInvalidNamespace, "the namespace is unknown"},
    {cimInvalidParameter, "a parameter is wrong"},
    {cimInvalidClass, "the class is not served"},
    {cimNotFound, "there is no such instance"},
    {cimNotSupported, "it is not supported"},
    {cimAlreadyExists, "it exists already"},
    {cimNoSuchProperty, "the class has no such property"},
    {cimTypeMismatch, "a value is of the wrong type"},
    {cimQueryLanguageNotSupported, "the query language is not supported"},
    {cimInvalidQuery, "the query is not understood"},
    {cimMethodNotAvailable, "the method is not available"},
    {cimMethodNotFound, "there is no such method"},
};

}  // namespace

std::string wordsForStatus(unsigned code) {
    for (const StatusWords& each : statusWords)
        if (each.code == code) return each.words;
    return "the provider failed with status " + std::to_string(code);
}

}  // namespace cmpihost::server
