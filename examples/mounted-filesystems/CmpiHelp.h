// What every provider needs around the macros of CMPI: whatever the object manager gives can be
// null or come with a status other than OK. What it makes belongs to it and goes when the request
// ends, so nothing here is released.
#ifndef CMPI_HELP_H
#define CMPI_HELP_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <strings.h>

#include <stdexcept>
#include <string>

/// Ends a request with a CIM status other than OK.
class CimError : public std::runtime_error {
  public:
    CimError(CMPIrc rc, const std::string& message) : std::runtime_error(message), rc_(rc) {}
    CMPIrc rc() const { return rc_; }

  private:
    CMPIrc rc_;
};

/// Throws CimError unless the status is OK; the message says what was done, and to what.
inline void require(const CMPIStatus& status, const char* what, const char* name = "") {
    if (status.rc == CMPI_RC_OK) return;
    throw CimError(status.rc, std::string("the object manager refuses ") + what + name);
}

/// The object; throws CimError when it is null or the status is not OK.
template <class Object>
Object* required(Object* object, const CMPIStatus& status, const char* what) {
    require(status, what);
    if (!CMIsNullObject(object)) return object;
    throw CimError(CMPI_RC_ERR_FAILED, std::string("the object manager gives no ") + what);
}

/// A copy; throws CimError for null.
inline std::string text(const CMPIString* string) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    required(string, status, "text");
    const char* const characters = CMGetCharsPtr(string, &status);
    require(status, "the characters of a text");
    if (characters == nullptr) throw CimError(CMPI_RC_ERR_FAILED, "a text has no characters");
    return characters;
}

inline std::string nameSpace(const CMPIObjectPath* path) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    return text(required(CMGetNameSpace(path, &status), status, "namespace"));
}

inline std::string className(const CMPIObjectPath* path) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    return text(required(CMGetClassName(path, &status), status, "class name"));
}

/// Names of classes and roles are the same in any letter case.
inline bool sameName(const std::string& left, const std::string& right) {
    return strcasecmp(left.c_str(), right.c_str()) == 0;
}

/// The value of a key; throws CimError when the path lacks it.
inline CMPIData keyOf(const CMPIObjectPath* path, const char* name) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData key = CMGetKey(path, name, &status);
    if (status.rc == CMPI_RC_OK && !CMIsNullValue(key)) return key;
    throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, std::string("the path lacks the key ") + name);
}

/// The text of a key. Object managers differ in the type that they give it.
inline std::string text(const CMPIData& key) {
    if (key.type == CMPI_string) return text(key.value.string);
    if (key.type == CMPI_chars && key.value.chars != nullptr) return key.value.chars;
    throw CimError(CMPI_RC_ERR_INVALID_PARAMETER, "a key is no text");
}

inline void addKey(CMPIObjectPath* path, const char* name, const std::string& value) {
    require(CMAddKey(path, name, value.c_str(), CMPI_chars), "key ", name);
}

inline void addKey(CMPIObjectPath* path, const char* name, CMPIObjectPath* value) {
    require(CMAddKey(path, name, &value, CMPI_ref), "key ", name);
}

inline void setText(CMPIInstance* instance, const char* name, const std::string& value) {
    require(CMSetProperty(instance, name, value.c_str(), CMPI_chars), "property ", name);
}

/// The object manager reads as many bytes as the CMPI type has: `Value` must be the C type of it.
template <class Value>
void set(CMPIInstance* instance, const char* name, Value value, CMPIType type) {
    require(CMSetProperty(instance, name, &value, type), "property ", name);
}

inline bool samePath(const CMPIObjectPath* given, const CMPIObjectPath* own);

inline bool sameKey(const char* name, const CMPIData& given, const CMPIData& own) {
    if (own.type == CMPI_ref) {
        return given.type == CMPI_ref && samePath(given.value.ref, own.value.ref);
    }
    const std::string left = text(given);
    const std::string right = text(own);
    const bool isClass =
        sameName(name, "CreationClassName") || sameName(name, "CSCreationClassName");
    return isClass ? sameName(left, right) : left == right;
}

/// Whether a path that a client gave means the object of a path that the provider made. Keys are
/// texts or references. Throws CimError when the given path lacks a key.
inline bool samePath(const CMPIObjectPath* given, const CMPIObjectPath* own) {
    if (!sameName(className(given), className(own))) return false;
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPICount count = CMGetKeyCount(own, &status);
    require(status, "the count of keys");
    if (count == 0) throw CimError(CMPI_RC_ERR_FAILED, "a path has no keys");
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* keyName = nullptr;
        const CMPIData key = CMGetKeyAt(own, index, &keyName, &status);
        require(status, "a key");
        const std::string name = text(keyName);
        if (!sameKey(name.c_str(), keyOf(given, name.c_str()), key)) return false;
    }
    return true;
}

#endif
