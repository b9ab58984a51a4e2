#include "host/server/Operations.h"

#include <algorithm>

#include "base/Ascii.h"

namespace cmpihost::server {

const OperationRow* findOperation(std::string_view name) {
    for (const auto* group :
         {&instanceOperations(), &associationOperations(), &classOperations(), &pullOperations()}) {
        const auto row = std::find_if(group->begin(), group->end(), [&](const OperationRow& each) {
            return base::equalsIgnoreCase(each.name, name);
        });
        if (row != group->end()) return &*row;
    }
    return nullptr;
}

}  // namespace cmpihost::server
