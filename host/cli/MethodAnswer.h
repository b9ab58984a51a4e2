#ifndef HOST_CLI_METHOD_ANSWER_H
#define HOST_CLI_METHOD_ANSWER_H

#include <memory>
#include <ostream>
#include <string>

#include "host/broker/Operation.h"
#include "host/cli/Printer.h"
#include "host/mof/Schema.h"

/// What a method answers is shown like an instance: its properties are the return value, named as
/// WBEM has it, and the arguments that came out.
namespace cmpihost {

constexpr const char* returnValueName = "ReturnValue";

/// What the schema declares for the answer: a class of the request's class name with a property for
/// the return value and one for each parameter that comes out. No class when the schema does not
/// have the method.
Schema answerSchema(const OperationRequest& request, const Schema& schema);

/// The answer, under the path of the object that was asked. Without the return value when the
/// provider returned none.
InstanceValue answerInstance(const OperationRequest& request, const OperationResult& result);

/// Writes the answer as a JSON object.
void writeAnswerJson(const OperationRequest& request, const OperationResult& result,
                     const Schema& schema, std::ostream& stream);

}  // namespace cmpihost

#endif
