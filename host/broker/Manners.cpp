#include "host/broker/Manners.h"

#include <initializer_list>

namespace cmpihost {

namespace {

struct Slot {
    const char* name;
    bool filled;
};

template <class Table>
std::vector<std::string> complaints(const char* kind, const Table& table,
                                    std::initializer_list<Slot> slots) {
    const std::string who = std::string("table of the ") + kind + " MI: ";
    std::vector<std::string> result;
    if (table.ftVersion < 100) {
        result.push_back(who + "ftVersion " + std::to_string(table.ftVersion) + " is below 100");
    }
    if (table.miVersion > table.ftVersion) {
        result.push_back(who + "miVersion " + std::to_string(table.miVersion) +
                         " is above ftVersion " + std::to_string(table.ftVersion));
    }
    if (table.miName == nullptr) result.push_back(who + "miName is null");
    for (const Slot& slot : slots) {
        if (!slot.filled) result.push_back(who + slot.name + " is null");
    }
    return result;
}

}  // namespace

std::vector<std::string> badManners(const CMPIInstanceMIFT& table) {
    return complaints("instance", table,
                      {{"cleanup", table.cleanup != nullptr},
                       {"enumerateInstanceNames", table.enumerateInstanceNames != nullptr},
                       {"enumerateInstances", table.enumerateInstances != nullptr},
                       {"getInstance", table.getInstance != nullptr},
                       {"createInstance", table.createInstance != nullptr},
                       {"modifyInstance", table.modifyInstance != nullptr},
                       {"deleteInstance", table.deleteInstance != nullptr},
                       {"execQuery", table.execQuery != nullptr}});
}

std::vector<std::string> badManners(const CMPIAssociationMIFT& table) {
    return complaints("association", table,
                      {{"cleanup", table.cleanup != nullptr},
                       {"associators", table.associators != nullptr},
                       {"associatorNames", table.associatorNames != nullptr},
                       {"references", table.references != nullptr},
                       {"referenceNames", table.referenceNames != nullptr}});
}

}  // namespace cmpihost
