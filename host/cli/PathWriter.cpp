#include "host/cli/PathText.h"
#include "host/cli/ReadableText.h"
#include "host/cli/ValueKind.h"

namespace cmpihost {

namespace {

std::string quoted(const std::string& text) {
    std::string result = "\"";
    for (const char c : text) {
        if (c == '"' || c == '\\') {
            result += '\\';
        }
        result += c;
    }
    return result + '"';
}

std::string keyValue(const Value& value) {
    switch (kindOf(value)) {
        case ValueKind::Null:
            return "\"\"";
        case ValueKind::Boolean:
            return value.boolean() ? "TRUE" : "FALSE";
        case ValueKind::Unsigned:
        case ValueKind::Signed:
            return value.toText();
        case ValueKind::Real:
            return realText(value.real(), value.type());
        case ValueKind::Reference:
            return quoted(writePath(value.reference()));
        case ValueKind::Character:
            return quoted(characterText(value.unsignedInteger()));
        default:
            return quoted(value.toText());
    }
}

}  // namespace

std::string writePath(const ObjectPathValue& path) {
    std::string result;
    if (!path.hostName.empty()) {
        result += "//" + path.hostName + "/";
    }
    if (!path.nameSpace.empty()) {
        result += path.nameSpace + ":";
    }
    result += path.className;
    char separator = '.';
    for (const KeyBinding& key : path.keys) {
        result += separator + key.name + "=" + keyValue(key.value);
        separator = ',';
    }
    return result;
}

}  // namespace cmpihost
