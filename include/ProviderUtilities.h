#ifndef VA_PROVIDER_UTILITIES_H
#define VA_PROVIDER_UTILITIES_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <string>
#include <type_traits>
#include <vector>

#include "Moniker.h"

namespace VA {

/// Reads and builds CMPI object paths and instances, on any CMPI broker: low table versions, absent
/// optional functions and differing key types are taken as they come.
///
/// Ownership: paths and instances that are created belong to the broker, which reclaims them after
/// the request; nothing here releases anything. Null paths, instances and references are accepted
/// everywhere: nothing is done then, and the result is null, 0, "" or false.
/// Threads: no state, every function may be called from any number of threads.
/// Failures show only in the results named here; std::bad_alloc may leave any function.
class __attribute__((visibility("default"))) ProviderUtilities {
  public:
    /// The class id of a path's class, or of a class name: 1 KORVA_ComputerSystem,
    /// 55 KORVA_OperatingSystem, 56 KORVA_OperatingSystemCapabilities, 57 KORVA_InstalledOS,
    /// 64 KORVA_RunningOS, 65 KORVA_OSElementCapabilities; 0 for any other, and for null.
    /// Letter case does not matter.
    static unsigned short getClassId(const CMPIObjectPath* path);
    static unsigned short getClassId(const char* className);

    /// Number of key bindings; 0 for a class path.
    static unsigned int getKeyCount(const CMPIObjectPath* path);

    /// The namespace of the path, "" if it has none.
    static std::string getNamespace(const CMPIObjectPath* path);

    /// A new path without keys, or null when the broker made none.
    static CMPIObjectPath* createObjectPath(const CMPIBroker* broker, const char* className,
                                            std::string nameSpace);

    /// Adds or replaces a key binding: a text, or a reference to another path.
    static void setKeyProperty(CMPIObjectPath* path, const char* name, const char* value);
    static void setKeyProperty(CMPIObjectPath* path, const char* name, const std::string& value);
    static void setKeyProperty(CMPIObjectPath* path, const char* name, CMPIObjectPath* value);

    /// Reads a key binding as text. A number is given in decimal, a boolean as "true" or "false".
    /// False, and `value` is left alone, when there is no such key, or when it is a reference or
    /// null.
    static bool getKeyProperty(const CMPIObjectPath* path, const char* name, std::string& value);

    /// Reads a key binding that is a reference; the path given out belongs to `path`.
    /// False, and `*value` is left alone, when there is no such key or it is no reference.
    static bool getKeyProperty(const CMPIObjectPath* path, const char* name,
                               const CMPIObjectPath** value);

    /// A new instance for the path, with the path's keys as properties; null when the broker made
    /// none.
    static CMPIInstance* createInstance(const CMPIBroker* broker, CMPIObjectPath* path);

    /// Sets a property; the CIM type is that of the argument: boolean, uint16, sint16, uint32,
    /// uint64 (for unsigned long too, whatever its size), string, reference. Of no other type does
    /// it compile; a text may be any that converts to const char*.
    static void setProperty(CMPIInstance* instance, const char* name, bool value);
    static void setProperty(CMPIInstance* instance, const char* name, unsigned short value);
    static void setProperty(CMPIInstance* instance, const char* name, short value);
    static void setProperty(CMPIInstance* instance, const char* name, unsigned int value);
    static void setProperty(CMPIInstance* instance, const char* name, unsigned long long value);
    static void setProperty(CMPIInstance* instance, const char* name, unsigned long value);
    static void setProperty(CMPIInstance* instance, const char* name, std::string& value);
    static void setProperty(CMPIInstance* instance, const char* name, const char* value);
    static void setProperty(CMPIInstance* instance, const char* name, CMPIObjectPath* value);
    // A pointer or an enumerator would be converted, to a boolean or to some number.
    template <class Other, class = std::enable_if_t<!std::is_convertible_v<Other, const char*>>>
    static void setProperty(CMPIInstance* instance, const char* name, Other value) = delete;

    /// Sets an array property: uint16[] or string[].
    static void setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                            std::vector<unsigned short>& value);
    static void setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                            std::vector<std::string>& value);

    /// With `isDateTime`, sets a datetime property from its 25-character CIM text; a text that is
    /// no CIM datetime leaves the property out. Without, sets a plain string.
    static void setProperty(const CMPIBroker* broker, CMPIInstance* instance, const char* name,
                            std::string& text, bool isDateTime);

    /// Appends the path's key bindings to the moniker, in the path's order, values as text (as
    /// getKeyProperty gives them). A reference has no text and is passed over.
    static void transformObjectPathToMoniker(const CMPIObjectPath* path, Moniker& moniker);

    /// Sets the moniker's keys as key bindings on the path that `*path` holds. The moniker is only
    /// read; its selected key changes.
    static void transformMonikerToObjectPath(Moniker& moniker, CMPIObjectPath** path);
};

}  // namespace VA

#endif
