#include "host/cli/PathParser.h"
#include "host/cli/ValueText.h"

namespace cmpihost {

namespace {

std::string quoted(const std::string& text) {
    std::string result = "\"";
    for (const char c : text) {
        if (c == '"' || c == '\\') result += '\\';
        result += c;
    }
    return result + '"';
}

std::string keyValue(const Value& value) {
    switch (categoryOf(value)) {
        case TypeCategory::Null:
            return "\"\"";
        case TypeCategory::Boolean:
            return value.boolean() ? "TRUE" : "FALSE";
        case TypeCategory::Unsigned:
        case TypeCategory::Signed:
            return value.toText();
        case TypeCategory::Real:
            return realText(value.real(), value.type());
        case TypeCategory::Reference:
            return quoted(writePath(value.reference()));
        case TypeCategory::Character:
            return quoted(characterText(value.unsignedInteger()));
        default:
            return quoted(value.toText());
    }
}

}  // namespace

std::string writePath(const ObjectPathValue& path) {
    std::string result;
    if (!path.hostName.empty()) result += "//" + path.hostName + "/";
    if (!path.nameSpace.empty()) result += path.nameSpace + ":";
    result += path.className;
    char separator = '.';
    for (const KeyBinding& key : path.keys) {
        result += separator + key.name + "=" + keyValue(key.value);
        separator = ',';
    }
    return result;
}

}  // namespace cmpihost
