#include "host/server/ResponseValidator.h"

#include <strings.h>

#include <algorithm>

#include "host/server/ResponseGrammar.h"
#include "host/server/ResponseXml.h"

namespace cmpihost::server {

namespace {

using validator::Complaints;
using validator::Element;

/// What an operation answers.
struct OperationRow {
    const char* name;
    /// The content of IRETURNVALUE; null: there is no IRETURNVALUE.
    const char* results;
    /// Whether PARAMVALUEs tell how the enumeration goes on.
    bool pulled = false;
};

constexpr OperationRow operationRows[] = {
    {"GetInstance", "INSTANCE"},
    {"EnumerateInstances", "VALUE.NAMEDINSTANCE*"},
    {"EnumerateInstanceNames", "INSTANCENAME*"},
    {"CreateInstance", "INSTANCENAME"},
    {"Associators", "VALUE.OBJECTWITHPATH*"},
    {"References", "VALUE.OBJECTWITHPATH*"},
    {"AssociatorNames", "OBJECTPATH*"},
    {"ReferenceNames", "OBJECTPATH*"},
    {"GetClass", "CLASS"},
    {"EnumerateClasses", "CLASS*"},
    {"EnumerateClassNames", "CLASSNAME*"},
    {"GetProperty", "VALUE|VALUE.ARRAY|VALUE.REFERENCE?"},
    {"GetQualifier", "QUALIFIER.DECLARATION"},
    {"EnumerateQualifiers", "QUALIFIER.DECLARATION*"},
    {"ExecQuery", "VALUE.OBJECT* / VALUE.OBJECTWITHPATH*"},
    {"SetProperty", nullptr},
    {"ModifyInstance", nullptr},
    {"DeleteInstance", nullptr},
    {"CreateClass", nullptr},
    {"ModifyClass", nullptr},
    {"DeleteClass", nullptr},
    {"SetQualifier", nullptr},
    {"DeleteQualifier", nullptr},
    {"CloseEnumeration", nullptr},
    {"EnumerationCount", "VALUE"},
    {"OpenEnumerateInstances", "VALUE.INSTANCEWITHPATH*", true},
    {"OpenReferenceInstances", "VALUE.INSTANCEWITHPATH*", true},
    {"OpenAssociatorInstances", "VALUE.INSTANCEWITHPATH*", true},
    {"PullInstancesWithPath", "VALUE.INSTANCEWITHPATH*", true},
    {"OpenEnumerateInstancePaths", "INSTANCEPATH*", true},
    {"OpenReferenceInstancePaths", "INSTANCEPATH*", true},
    {"OpenAssociatorInstancePaths", "INSTANCEPATH*", true},
    {"PullInstancePaths", "INSTANCEPATH*", true},
    {"OpenQueryInstances", "INSTANCE*", true},
    {"PullInstances", "INSTANCE*", true},
};

const OperationRow* rowOfOperation(const std::string& name) {
    for (const OperationRow& row : operationRows)
        if (strcasecmp(row.name, name.c_str()) == 0) return &row;
    return nullptr;
}

const Element* childNamed(const Element& element, const char* name) {
    for (const Element& child : element.children)
        if (child.name == name) return &child;
    return nullptr;
}

/// The output parameter of that name, null for none.
const Element* outputNamed(const Element& response, const char* name) {
    for (const Element& child : response.children) {
        const std::string* const own = child.attribute("NAME");
        if (child.name == "PARAMVALUE" && own != nullptr && *own == name) return &child;
    }
    return nullptr;
}

std::string textOf(const Element& output) {
    const Element* const value = childNamed(output, "VALUE");
    return value == nullptr ? std::string() : value->text;
}

void checkPulled(const Element& response, const OperationRow& row, Complaints& complaints) {
    const Element* const end = outputNamed(response, "EndOfSequence");
    const Element* const context = outputNamed(response, "EnumerationContext");
    const std::string ended = end == nullptr ? "" : textOf(*end);
    if (ended != "TRUE" && ended != "FALSE") complaints.push_back("no EndOfSequence");
    if (context == nullptr) complaints.push_back("no EnumerationContext");
    if (ended == "FALSE" && context != nullptr && textOf(*context).empty())
        complaints.push_back("an empty EnumerationContext before the end");
    const bool query = strcasecmp(row.name, "OpenQueryInstances") == 0;
    const std::size_t others = query && outputNamed(response, "QueryResultClass") != nullptr;
    const auto outputs =
        std::count_if(response.children.begin(), response.children.end(),
                      [](const Element& child) { return child.name == "PARAMVALUE"; });
    if (static_cast<std::size_t>(outputs) > 2 + others)
        complaints.push_back("an unknown PARAMVALUE");
}

/// Judges the IMETHODRESPONSE of an operation that did not fail.
void checkResults(const Element& response, const std::string& name, Complaints& complaints) {
    const OperationRow* const row = rowOfOperation(name);
    if (row == nullptr) return complaints.push_back("success of an unknown operation " + name);
    const Element* const results = childNamed(response, "IRETURNVALUE");
    if (row->results == nullptr && results != nullptr)
        complaints.push_back(name + " has no IRETURNVALUE");
    if (row->results != nullptr && results == nullptr)
        complaints.push_back(name + " lacks its IRETURNVALUE");
    if (row->results != nullptr && results != nullptr &&
        !validator::fitsContent(*results, row->results))
        complaints.push_back(name + " does not answer such an IRETURNVALUE");
    if (row->pulled) {
        checkPulled(response, *row, complaints);
    } else if (childNamed(response, "PARAMVALUE") != nullptr) {
        complaints.push_back(name + " has no PARAMVALUE");
    }
}

/// The IMETHODRESPONSE or METHODRESPONSE; null where the frame is broken.
const Element* responseIn(const Element& root) {
    const Element* const message = childNamed(root, "MESSAGE");
    const Element* const simple = message == nullptr ? nullptr : childNamed(*message, "SIMPLERSP");
    return simple == nullptr || simple->children.empty() ? nullptr : &simple->children.front();
}

std::vector<std::string> judge(const std::string& document, const std::string* operationName) {
    Complaints complaints;
    const std::optional<Element> root = validator::readTree(document, complaints);
    validator::checkBytes(document, complaints);
    if (!root) return complaints;
    if (root->name != "CIM") complaints.push_back("the root is " + root->name);
    validator::checkElement(*root, "", complaints);
    const Element* const response = responseIn(*root);
    const std::string* const name = response == nullptr ? nullptr : response->attribute("NAME");
    if (name == nullptr) return complaints;
    if (operationName != nullptr && *name != *operationName)
        complaints.push_back("it answers " + *name + ", not " + *operationName);
    if (response->name == "IMETHODRESPONSE" && childNamed(*response, "ERROR") == nullptr)
        checkResults(*response, *name, complaints);
    return complaints;
}

}  // namespace

std::vector<std::string> complaintsAbout(const std::string& document) {
    return judge(document, nullptr);
}

std::vector<std::string> complaintsAbout(const std::string& document,
                                         const std::string& operationName) {
    return judge(document, &operationName);
}

}  // namespace cmpihost::server
