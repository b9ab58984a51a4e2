// Object managers differ in what they hand out: keys in any order and spelling, numbers where texts
// are declared, paths without a namespace. Here they become canonical paths, which compare as they
// are. ProviderUtilities.cpp reads paths too, but leaves out what a broker fails to give: here the
// request ends then, since a path that silently lacks a key would name another instance.
#include "ObjectPath.h"

#include <cmpi/cmpift.h>

#include <algorithm>
#include <array>
#include <cstdio>

#include "CimError.h"
#include "base/Ascii.h"
#include "base/CmpiText.h"

namespace VA::OSStatusFacade {

namespace {

void requireOk(const CMPIStatus& status, const char* what) {
    if (status.rc != CMPI_RC_OK) {
        throw CimError(CMPI_RC_ERR_FAILED, std::string("the object manager does not tell ") + what);
    }
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
        case CMPI_dateTime:
            return data.value.dateTime == nullptr;
        default:
            return data.type == CMPI_null;
    }
}

// With its length in front a text cannot pass for another one and what follows it.
std::string withLength(const std::string& text) {
    return std::to_string(text.size()) + ":" + text;
}

// One text that stands for a canonical path and for no other.
std::string textOf(const CanonicalPath& path) {
    std::string text = withLength(path.classPath);
    for (const auto& [name, value] : path.keys) text += withLength(name) + withLength(value);
    return text;
}

std::string hexadecimal(double value) {
    std::array<char, 40> text{};
    std::snprintf(text.data(), text.size(), "%a", value);
    return text.data();
}

std::string textOf(const CMPIDateTime* dateTime) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIString* const text = dateTime->ft->getStringFormat(dateTime, &status);
    requireOk(status, "a date");
    return charactersOf(text);
}

// The value of a key that is neither text nor reference; empty for types that no key can have.
std::string otherValue(const CMPIData& data) {
    switch (data.type) {
        case CMPI_real32:
            return hexadecimal(static_cast<double>(data.value.real32));
        case CMPI_real64:
            return hexadecimal(data.value.real64);
        case CMPI_dateTime:
            return textOf(data.value.dateTime);
        default:
            return {};
    }
}

std::string comparable(const KeyBinding& key, std::string_view nameSpace) {
    if (const CMPIObjectPath* reference = key.reference()) {
        return "reference " + textOf(canonicalPathOf(reference, nameSpace));
    }
    const std::optional<std::string> text = key.text();
    if (!text) return "type " + std::to_string(key.data.type) + " " + otherValue(key.data);
    const bool withoutCase =
        base::equalsIgnoreCase(key.name, "CSName") || base::equalsIgnoreCase(key.name, "Name");
    return "text " + (withoutCase ? base::toLower(*text) : *text);
}

}  // namespace

std::string charactersOf(const CMPIString* string) {
    if (string == nullptr || string->hdl == nullptr) return {};
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const char* const characters = string->ft->getCharPtr(string, &status);
    if (characters == nullptr) status.rc = CMPI_RC_ERR_FAILED;
    requireOk(status, "a text");
    return characters;
}

std::string classNameOf(const CMPIObjectPath* path) {
    if (path == nullptr) return {};
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIString* const name = path->ft->getClassName(path, &status);
    if (name == nullptr) status.rc = CMPI_RC_ERR_FAILED;
    requireOk(status, "a class");
    return charactersOf(name);
}

std::string nameSpaceOf(const CMPIObjectPath* path) {
    if (path == nullptr) return {};
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIString* const nameSpace = path->ft->getNameSpace(path, &status);
    requireOk(status, "a namespace");
    return charactersOf(nameSpace);
}

const CMPIObjectPath* KeyBinding::reference() const {
    return data.type == CMPI_ref ? data.value.ref : nullptr;
}

std::optional<std::string> KeyBinding::text() const {
    if (data.type == CMPI_string) return charactersOf(data.value.string);
    if (data.type == CMPI_chars) return data.value.chars;
    return base::scalarText(data);
}

std::vector<KeyBinding> keysOf(const CMPIObjectPath* path) {
    std::vector<KeyBinding> keys;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPICount count = path == nullptr ? 0 : path->ft->getKeyCount(path, &status);
    requireOk(status, "how many keys there are");
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* name = nullptr;
        const CMPIData data = path->ft->getKeyAt(path, index, &name, &status);
        requireOk(status, "a key");
        if (!isAbsent(data)) keys.push_back({charactersOf(name), data});
    }
    return keys;
}

const CMPIObjectPath* pathOf(const CMPIInstance* instance) {
    const CMPIObjectPath* const path = instance->ft->getObjectPath(instance, nullptr);
    if (path == nullptr) {
        throw CimError(CMPI_RC_ERR_FAILED, "the object manager does not tell a path");
    }
    return path;
}

const CMPIObjectPath* referenceOf(const CMPIObjectPath* path, const char* role) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData data = path->ft->getKey(path, role, &status);
    if (status.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY || status.rc == CMPI_RC_ERR_NOT_FOUND) {
        return nullptr;
    }
    requireOk(status, "a reference");
    return data.type == CMPI_ref && !isAbsent(data) ? data.value.ref : nullptr;
}

CanonicalPath canonicalPathOf(const CMPIObjectPath* path, std::string_view nameSpace) {
    const std::string own = nameSpaceOf(path);
    CanonicalPath canonical;
    canonical.classPath =
        base::toLower((own.empty() ? std::string(nameSpace) : own) + ":" + classNameOf(path));
    for (const KeyBinding& key : keysOf(path)) {
        canonical.keys.emplace_back(base::toLower(key.name), comparable(key, nameSpace));
    }
    std::sort(canonical.keys.begin(), canonical.keys.end());
    return canonical;
}

}  // namespace VA::OSStatusFacade
