#include "ObjectPath.h"

#include <cmpi/cmpift.h>

#include <algorithm>

#include "Names.h"
#include "Refusal.h"

namespace VA::OSStatusFacade {

namespace {

void requireTold(const CMPIStatus& status, const char* what) {
    if (status.rc != CMPI_RC_OK)
        throw Refusal(CMPI_RC_ERR_FAILED, std::string("the object manager does not tell ") + what);
}

bool isAbsent(const CMPIData& data) {
    if ((data.state & (CMPI_nullValue | CMPI_notFound | CMPI_badValue)) != 0) return true;
    switch (data.type) {
        case CMPI_string:
            return data.value.string == nullptr || data.value.string->hdl == nullptr;
        case CMPI_chars:
            return data.value.chars == nullptr;
        case CMPI_ref:
            return data.value.ref == nullptr;
        default:
            return data.type == CMPI_null;
    }
}

// One text that stands for an identity and for no other.
std::string textOf(const Identity& identity) {
    std::string text = identity.classPath;
    for (const auto& [name, value] : identity.keys)
        text.append("\n").append(name).append("=").append(std::to_string(value.size()) + ":" +
                                                          value);
    return text;
}

std::string comparable(const KeyBinding& key, std::string_view nameSpace) {
    if (const CMPIObjectPath* reference = key.reference())
        return "reference " + textOf(identityOf(reference, nameSpace));
    const std::string text = key.text().value_or("");
    const bool withoutCase = equalNames(key.name, "CSName") || equalNames(key.name, "Name");
    return "text " + (withoutCase ? lowered(text) : text);
}

}  // namespace

std::string charactersOf(const CMPIString* string) {
    if (string == nullptr || string->hdl == nullptr) return {};
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const char* const characters = string->ft->getCharPtr(string, &status);
    if (characters == nullptr) status.rc = CMPI_RC_ERR_FAILED;
    requireTold(status, "a text");
    return characters;
}

std::string classNameOf(const CMPIObjectPath* path) {
    if (path == nullptr) return {};
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIString* const name = path->ft->getClassName(path, &status);
    if (name == nullptr) status.rc = CMPI_RC_ERR_FAILED;
    requireTold(status, "a class");
    return charactersOf(name);
}

std::string nameSpaceOf(const CMPIObjectPath* path) {
    if (path == nullptr) return {};
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIString* const nameSpace = path->ft->getNameSpace(path, &status);
    requireTold(status, "a namespace");
    return charactersOf(nameSpace);
}

const CMPIObjectPath* KeyBinding::reference() const {
    return data.type == CMPI_ref ? data.value.ref : nullptr;
}

std::optional<std::string> KeyBinding::text() const {
    const CMPIValue& value = data.value;
    switch (data.type) {
        case CMPI_string:
            return charactersOf(value.string);
        case CMPI_chars:
            return value.chars;
        case CMPI_boolean:
            return value.boolean != 0 ? "true" : "false";
        case CMPI_uint8:
            return std::to_string(value.uint8);
        case CMPI_uint16:
            return std::to_string(value.uint16);
        case CMPI_uint32:
            return std::to_string(value.uint32);
        case CMPI_uint64:
            return std::to_string(value.uint64);
        case CMPI_sint8:
            return std::to_string(value.sint8);
        case CMPI_sint16:
            return std::to_string(value.sint16);
        case CMPI_sint32:
            return std::to_string(value.sint32);
        case CMPI_sint64:
            return std::to_string(value.sint64);
        case CMPI_char16:
            return std::to_string(value.char16);
        default:
            return std::nullopt;
    }
}

std::vector<KeyBinding> keysOf(const CMPIObjectPath* path) {
    std::vector<KeyBinding> keys;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPICount count = path == nullptr ? 0 : path->ft->getKeyCount(path, &status);
    requireTold(status, "how many keys there are");
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* name = nullptr;
        const CMPIData data = path->ft->getKeyAt(path, index, &name, &status);
        requireTold(status, "a key");
        if (!isAbsent(data)) keys.push_back({charactersOf(name), data});
    }
    return keys;
}

const CMPIObjectPath* pathOf(const CMPIInstance* instance) {
    const CMPIObjectPath* const path = instance->ft->getObjectPath(instance, nullptr);
    if (path == nullptr)
        throw Refusal(CMPI_RC_ERR_FAILED, "the object manager does not tell a path");
    return path;
}

const CMPIObjectPath* referenceOf(const CMPIObjectPath* path, const char* role) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData data = path->ft->getKey(path, role, &status);
    if (status.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY || status.rc == CMPI_RC_ERR_NOT_FOUND)
        return nullptr;
    requireTold(status, "a reference");
    return data.type == CMPI_ref && !isAbsent(data) ? data.value.ref : nullptr;
}

Identity identityOf(const CMPIObjectPath* path, std::string_view nameSpace) {
    const std::string own = nameSpaceOf(path);
    Identity identity;
    identity.classPath =
        lowered((own.empty() ? std::string(nameSpace) : own) + ":" + classNameOf(path));
    for (const KeyBinding& key : keysOf(path))
        identity.keys.emplace_back(lowered(key.name), comparable(key, nameSpace));
    std::sort(identity.keys.begin(), identity.keys.end());
    return identity;
}

}  // namespace VA::OSStatusFacade
