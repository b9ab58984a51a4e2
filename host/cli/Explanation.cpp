// Filters are tried one by one on the provider itself: what a role or class means to it is not for
// the schema to say.
#include "host/cli/Explanation.h"

#include "base/Utf8.h"
#include "host/cli/Diagnostics.h"

namespace cmpihost {

namespace {

using Ask = std::function<OperationResult(const OperationRequest&)>;
using RequestField = std::optional<std::string> OperationRequest::*;

struct RequestFilter {
    const char* option;
    RequestField field;
};

constexpr RequestFilter requestFilters[] = {{"--assoc-class", &OperationRequest::assocClass},
                                            {"--result-class", &OperationRequest::resultClass},
                                            {"--role", &OperationRequest::role},
                                            {"--result-role", &OperationRequest::resultRole}};

bool isEmpty(const OperationResult& result) {
    return result.paths.empty() && result.instances.empty();
}

std::size_t count(const OperationResult& result) {
    return result.paths.size() + result.instances.size();
}

/// The request with that filter alone, or with none.
OperationRequest filteredBy(OperationRequest request, RequestField kept) {
    for (const RequestFilter& filter : requestFilters)
        if (filter.field != kept) (request.*filter.field).reset();
    return request;
}

std::string written(const RequestFilter& filter, const OperationRequest& request) {
    return std::string(filter.option) + " " +
           base::escapeForTerminal((request.*filter.field).value_or(std::string()));
}

/// The filters of the request as they were written, with "and" between.
std::string filtersOf(const OperationRequest& request) {
    std::string all;
    for (const RequestFilter& filter : requestFilters) {
        if (request.*filter.field) all += (all.empty() ? "" : " and ") + written(filter, request);
    }
    return all;
}

/// What the filters leave out of that many results.
std::string reasonOfFilters(const OperationRequest& request, std::size_t without, const Ask& ask) {
    const std::string end =
        ": without filters there " + (without == 1 ? std::string("is one result")
                                                   : "are " + std::to_string(without) + " results");
    std::string notes;
    for (const RequestFilter& filter : requestFilters) {
        if (!(request.*filter.field)) continue;
        if (isEmpty(ask(filteredBy(request, filter.field))))
            notes += noteLine("nothing passes the filter " + written(filter, request) + end);
    }
    return notes.empty()
               ? noteLine("nothing passes the filters " + filtersOf(request) + " together" + end)
               : notes;
}

std::string reasonOfSource(const OperationRequest& request, const std::string& limits,
                           const Ask& ask) {
    OperationRequest source;
    source.operation = Operation::GetInstance;
    source.path = request.path;
    const OperationResult result = ask(source);
    const std::string path = base::escapeForTerminal(toString(request.path));
    const bool missing =
        result.rc == CMPI_RC_ERR_NOT_FOUND || (result.rc == CMPI_RC_OK && result.instances.empty());
    if (missing) return noteLine("there is no instance " + path);
    return noteLine("nothing is associated with " + path + limits);
}

std::string reasonOfAssociation(const OperationRequest& request, const Ask& ask) {
    const std::string filters = filtersOf(request);
    if (!filters.empty()) {
        const OperationResult unfiltered = ask(filteredBy(request, nullptr));
        // Who cannot answer without filters leaves open what there is without them.
        if (unfiltered.rc != CMPI_RC_OK)
            return reasonOfSource(request, " that passes " + filters, ask);
        if (!isEmpty(unfiltered)) return reasonOfFilters(request, count(unfiltered), ask);
    }
    return reasonOfSource(request, "", ask);
}

std::string reasonOfClass(const OperationRequest& request, const Schema& schema) {
    const mof::Class* declared = schema.find(request.path.className);
    if (declared != nullptr && mof::isSet(declared->qualifiers, "Abstract"))
        return noteLine("the class " + declared->name + " is abstract: it has no instances itself");
    return noteLine("there is no instance of " + base::escapeForTerminal(request.path.className) +
                    " in " + base::escapeForTerminal(request.path.nameSpace));
}

}  // namespace

bool isEmptyAnswer(const OperationRequest& request, const OperationResult& result) {
    const bool returns = request.operation != Operation::ModifyInstance &&
                         request.operation != Operation::DeleteInstance &&
                         request.operation != Operation::InvokeMethod;
    return returns && result.rc == CMPI_RC_OK && isEmpty(result);
}

std::string reasonForNothing(const OperationRequest& request, const Schema& schema,
                             const Ask& ask) {
    if (isAssociationOperation(request.operation)) return reasonOfAssociation(request, ask);
    switch (request.operation) {
        case Operation::GetInstance:
            return noteLine("no instance was returned; an object manager answers " +
                            statusText(CMPI_RC_ERR_NOT_FOUND));
        case Operation::CreateInstance:
            return noteLine("the provider returned no path of the new instance");
        case Operation::ExecQuery:
            return noteLine("the query selects nothing");
        default:
            return reasonOfClass(request, schema);
    }
}

}  // namespace cmpihost
