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

/// A copy; empty for null.
inline std::string text(const CMPIString* string) {
    const char* const characters =
        CMIsNullObject(string) ? nullptr : CMGetCharsPtr(string, nullptr);
    return characters == nullptr ? std::string() : characters;
}

inline std::string className(const CMPIObjectPath* path) {
    return text(CMGetClassName(path, nullptr));
}

/// Names of classes and roles are the same in any letter case.
inline bool sameName(const std::string& left, const std::string& right) {
    return strcasecmp(left.c_str(), right.c_str()) == 0;
}

/// The key of a path; throws CimError when the path has none of that name.
inline CMPIData keyOf(const CMPIObjectPath* path, const char* name) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData key = CMGetKey(path, name, &status);
    require(status, "key ", name);
    return key;
}

inline std::string textKeyOf(const CMPIObjectPath* path, const char* name) {
    const CMPIData key = keyOf(path, name);
    return key.type == CMPI_string && !CMIsNullValue(key) ? text(key.value.string) : std::string();
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

/// Whether a path that a client gave means the object of a path that the provider made.
inline bool samePath(const CMPIObjectPath* given, const CMPIObjectPath* own) {
    if (!sameName(className(given), className(own))) return false;
    const CMPICount count = CMGetKeyCount(own, nullptr);
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* keyName = nullptr;
        const CMPIData key = CMGetKeyAt(own, index, &keyName, nullptr);
        const std::string name = text(keyName);
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        const CMPIData other = CMGetKey(given, name.c_str(), &status);
        if (status.rc != CMPI_RC_OK || CMIsNullValue(other) || other.type != key.type) return false;
        if (key.type == CMPI_ref) {
            if (!samePath(other.value.ref, key.value.ref)) return false;
            continue;
        }
        const std::string left = text(other.value.string);
        const std::string right = text(key.value.string);
        const bool holdsClass = name == "CreationClassName" || name == "CSCreationClassName";
        if (holdsClass ? !sameName(left, right) : left != right) return false;
    }
    return true;
}

#endif
