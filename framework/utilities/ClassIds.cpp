#include <strings.h>

#include "ProviderUtilities.h"
#include "Strings.h"

namespace VA {
namespace {

struct ClassId {
    const char* className;
    unsigned short id;
};

constexpr ClassId catalogue[] = {
    {"KORVA_ComputerSystem", 1},
    {"KORVA_OperatingSystem", 55},
    {"KORVA_OperatingSystemCapabilities", 56},
    {"KORVA_InstalledOS", 57},
    {"KORVA_RunningOS", 64},
    {"KORVA_OSElementCapabilities", 65},
};

constexpr unsigned short unknownClass = 0;

}  // namespace

unsigned short ProviderUtilities::getClassId(const CMPIObjectPath* path) {
    if (path == nullptr) return unknownClass;
    return getClassId(charactersOf(path->ft->getClassName(path, nullptr)));
}

unsigned short ProviderUtilities::getClassId(const char* className) {
    if (className == nullptr) return unknownClass;
    for (const ClassId& entry : catalogue)
        if (strcasecmp(entry.className, className) == 0) return entry.id;
    return unknownClass;
}

}  // namespace VA
