// Bodies of requests: their XML, the message in it, and its paths, values and parameters against
// the shipped schema.
#include <algorithm>

#include "fuzz/Invariant.h"
#include "host/mof/Schema.h"
#include "host/server/CimError.h"
#include "host/server/Message.h"
#include "host/server/Operations.h"
#include "host/server/RequestValue.h"

using namespace cmpihost;
using namespace cmpihost::server;
using fuzz::expect;

namespace {

const ClassCatalogue& catalogue() {
    static const Schema schema = Schema::load(KORVA_SOURCE_DIR "/schema");
    static const SchemaCatalogue classes(schema);
    return classes;
}

bool isPlainText(const std::string& text) {
    return !text.empty() &&
           std::all_of(text.begin(), text.end(), [](char c) { return c >= ' ' && c <= '~'; });
}

void checkNameSpace(const std::string& name) {
    expect(name.empty() || (name.front() != '/' && name.back() != '/'),
           "a namespace has no slashes at its ends");
    expect(name.find("//") == name.npos, "a namespace has no double slashes");
}

/// Runs what may end with a CIM status.
template <class Action>
void attempt(Action action) {
    try {
        action();
    } catch (const CimError& error) {
        expect(error.code() == cimInvalidParameter || error.code() == cimTypeMismatch,
               "what a client sends is wrong by its value or by its type");
        expect(*error.what() != '\0', "an error says what is wrong");
    }
}

void checkTypedPath(const RequestPath& path) {
    const ObjectPathValue typed = typedPath(path, catalogue(), "root/cimv2");
    expect(!typed.nameSpace.empty(), "a path is in a namespace");
    const ClassDeclaration* const declaration = catalogue().find(path.className);
    if (declaration == nullptr) return expect(typed.keys.size() == path.keys.size(), "no key goes");
    expect(typed.className == declaration->name, "a class is spelled as the schema spells it");
    if (!path.instance) return expect(typed.keys.empty(), "the path of a class has no keys");
    auto key = typed.keys.begin();
    for (const PropertyDeclaration& declared : declaration->properties) {
        if (!declared.key) continue;
        expect(key != typed.keys.end() && key->name == declared.name, "keys are in their order");
        expect(key->value.type() == declared.type && !key->value.isNull(),
               "a key has the type that the schema declares");
        ++key;
    }
    expect(key == typed.keys.end(), "a path has no other keys than the class");
}

void checkValue(const XmlElement& element) {
    for (const char* name : {"boolean", "string", "char16", "uint8", "sint64", "datetime", "real32",
                             "real64", "reference"}) {
        const CMPIType single = typeNamed(name).value();
        for (const CMPIType type : {single, static_cast<CMPIType>(single | CMPI_ARRAY)}) {
            attempt([&] {
                const Value value = readValue(element, type, catalogue(), "root/cimv2");
                expect(value.type() == type, "a value has the type that was asked for");
            });
        }
    }
}

void checkElement(const XmlElement& element) {
    const auto isOneOf = [&](std::initializer_list<const char*> names) {
        return std::find(names.begin(), names.end(), element.name) != names.end();
    };
    if (isOneOf({"CLASSNAME", "INSTANCENAME", "LOCALCLASSPATH", "LOCALINSTANCEPATH", "CLASSPATH",
                 "INSTANCEPATH", "VALUE.REFERENCE"})) {
        const RequestPath path = readPath(element);
        checkNameSpace(path.nameSpace);
        attempt([&] { checkTypedPath(path); });
    }
    if (isOneOf({"VALUE", "VALUE.ARRAY", "VALUE.REFERENCE", "VALUE.REFARRAY"})) checkValue(element);
    if (element.name == "INSTANCE") {
        attempt([&] { readInstance(element, catalogue(), "root/cimv2"); });
    }
    for (const XmlElement& child : element.children) checkElement(child);
}

void checkParameters(const Message& message) {
    const OperationRow* const row = findOperation(message.method);
    if (row == nullptr || !message.intrinsic) return;
    const Parameters parameters(row->parameters, message);
    for (const ParameterRow& each : row->parameters) {
        switch (each.kind) {
            case ParameterKind::Boolean:
                parameters.flag(each.name, true);
                break;
            case ParameterKind::Text:
                parameters.text(each.name);
                break;
            case ParameterKind::Number:
                parameters.number(each.name);
                break;
            case ParameterKind::ClassName:
                parameters.className(each.name);
                break;
            case ParameterKind::InstanceName:
            case ParameterKind::ObjectName:
                parameters.path(each.name);
                break;
            case ParameterKind::PropertyList:
                parameters.names(each.name);
                break;
            default:
                parameters.element(each.name);
        }
    }
}

void checkMessage(const Message& message) {
    expect(message.parameters.size() <= 64, "a message has at most 64 parameters");
    checkNameSpace(message.nameSpace);
    if (!message.intrinsic) attempt([&] { checkTypedPath(message.object); });
    for (const MessageParameter& parameter : message.parameters) {
        if (parameter.value) checkElement(*parameter.value);
    }
    attempt([&] { checkParameters(message); });
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    try {
        checkMessage(readMessage(fuzz::textOf(data, size)));
    } catch (const MessageError& error) {
        expect(error.httpStatus() == 400 || error.httpStatus() == 501,
               "what is no message is refused as a whole");
        expect(error.cimError() != nullptr, "a word tells clients why");
        expect(isPlainText(error.what()), "a sentence tells people why");
    }
    return 0;
}
