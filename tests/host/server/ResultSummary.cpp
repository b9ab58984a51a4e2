#include "host/server/ResultSummary.h"

#include "host/server/ServerFixture.h"
#include "host/server/XmlTree.h"

namespace cmpihost::server::fixture {

namespace {

const XmlElement* descendant(const XmlElement& element, const std::string& name) {
    if (element.name == name) return &element;
    for (const XmlElement& child : element.children)
        if (const XmlElement* const found = descendant(child, name)) return found;
    return nullptr;
}

std::string summaryOf(const XmlElement& element) {
    const XmlElement* const instance = descendant(element, "INSTANCENAME");
    if (instance == nullptr) {
        const XmlElement* const named = descendant(element, "CLASSNAME");
        return named == nullptr ? element.name : *named->attribute("NAME");
    }
    std::string keys;
    for (const XmlElement& key : instance->children) {
        const XmlElement* const reference = key.child("VALUE.REFERENCE");
        if (reference == nullptr) {
            keys = key.child("KEYVALUE")->text;
        } else {
            keys += (keys.empty() ? "" : ", ") + summaryOf(*reference);
        }
    }
    return *instance->attribute("CLASSNAME") + "(" + keys + ")";
}

}  // namespace

std::vector<std::string> objectsIn(const std::string& response) {
    if (!error(response).empty()) return {error(response)};
    const XmlElement root = parseXml(response);
    const XmlElement* const results = descendant(root, "IRETURNVALUE");
    if (results == nullptr) return {"no IRETURNVALUE"};
    std::vector<std::string> objects;
    for (const XmlElement& each : results->children) objects.push_back(summaryOf(each));
    return objects;
}

std::string valueOf(const std::string& response, const std::string& parameter) {
    const XmlElement root = parseXml(response);
    const XmlElement* const answer = descendant(root, "IMETHODRESPONSE");
    if (answer == nullptr) return "none";
    for (const XmlElement& each : answer->children) {
        if (each.name == "PARAMVALUE" && *each.attribute("NAME") == parameter)
            return each.child("VALUE") == nullptr ? "" : each.child("VALUE")->text;
    }
    return "none";
}

}  // namespace cmpihost::server::fixture
