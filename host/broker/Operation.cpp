#include "host/broker/Operation.h"

namespace cmpihost {

const char* operationName(Operation operation) noexcept {
    switch (operation) {
        case Operation::EnumerateInstances:
            return "EnumerateInstances";
        case Operation::EnumerateInstanceNames:
            return "EnumerateInstanceNames";
        case Operation::GetInstance:
            return "GetInstance";
        case Operation::CreateInstance:
            return "CreateInstance";
        case Operation::ModifyInstance:
            return "ModifyInstance";
        case Operation::DeleteInstance:
            return "DeleteInstance";
        case Operation::ExecQuery:
            return "ExecQuery";
        case Operation::Associators:
            return "Associators";
        case Operation::AssociatorNames:
            return "AssociatorNames";
        case Operation::References:
            return "References";
        case Operation::ReferenceNames:
            return "ReferenceNames";
    }
    return "unknown operation";
}

}  // namespace cmpihost
