#ifndef HOST_CLI_BARE_VALUES_H
#define HOST_CLI_BARE_VALUES_H

#include <memory>
#include <ostream>
#include <string>

#include "host/broker/Operation.h"
#include "host/cli/Printer.h"
#include "host/mof/Schema.h"

namespace cmpihost {

/// Whether a result of the request can have the property: a key, where it yields paths. Throws
/// UsageError, with the names that are near, when the schema says that none can; a class that the
/// schema does not know may declare anything.
void checkValueName(const std::string& property, const OperationRequest& request,
                    const Schema& schema);

/// For scripts: the values of one property or key, one a line and nothing beside them; the elements
/// of an array a line each. What has no value has no line. Texts stand as they are, but control
/// characters are written out, so that each is one line. The stream outlives the printer.
std::unique_ptr<Printer> makeValuePrinter(std::ostream& stream, const std::string& property);

/// That instances or paths of a result have no value of the property, so that the lines of the
/// values do not stand for all of them: "1 of 3 results have no value of Version". Empty when all
/// have one.
std::string noteOnValues(const std::string& property, const OperationResult& result);

}  // namespace cmpihost

#endif
