// An object manager calls factories while a request is open and closes a library only after cleanup
// of all its interfaces; a provider that behaves under one of them is loaded and left in the same
// order here.
#include "host/broker/ProviderLibrary.h"

#include "host/broker/BrokerCore.h"
#include "host/broker/Invoke.h"
#include "host/broker/LibraryFile.h"
#include "host/broker/Request.h"

#include <dlfcn.h>

#include <initializer_list>
#include <utility>

namespace cmpihost {

namespace {

struct Slot {
    const char* name;
    bool filled;
};

/// One line for each thing in a table that an object manager might not forgive.
template <class Table>
std::vector<std::string> findings(const char* kind, const Table& table,
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

std::vector<std::string> checkMiTable(const CMPIInstanceMIFT& table) {
    return findings("instance", table,
                    {{"cleanup", table.cleanup != nullptr},
                     {"enumerateInstanceNames", table.enumerateInstanceNames != nullptr},
                     {"enumerateInstances", table.enumerateInstances != nullptr},
                     {"getInstance", table.getInstance != nullptr},
                     {"createInstance", table.createInstance != nullptr},
                     {"modifyInstance", table.modifyInstance != nullptr},
                     {"deleteInstance", table.deleteInstance != nullptr},
                     {"execQuery", table.execQuery != nullptr}});
}

std::vector<std::string> checkMiTable(const CMPIAssociationMIFT& table) {
    return findings("association", table,
                    {{"cleanup", table.cleanup != nullptr},
                     {"associators", table.associators != nullptr},
                     {"associatorNames", table.associatorNames != nullptr},
                     {"references", table.references != nullptr},
                     {"referenceNames", table.referenceNames != nullptr}});
}

/// The message as the provider's own macros would read it: it may be no object of this broker.
std::string messageSuffix(const CMPIStatus& status) {
    if (status.msg == nullptr) return {};
    const char* const text = status.msg->ft->getCharPtr(status.msg, nullptr);
    return text == nullptr ? std::string() : std::string(": ") + text;
}

/// Finds and calls the factory of one kind of management interface.
template <class MI>
class Factory {
  public:
    Factory(void* library, const std::string& file, const std::string& provider, const char* kind)
        : where_(file + ": factory of the " + kind + " MI"), provider_(provider) {
        const std::string suffix = std::string("_Create_") + kind + "MI";
        // The generic one is called first: only it is told which provider is meant.
        generic_ = reinterpret_cast<Generic>(dlsym(library, ("_Generic" + suffix).c_str()));
        named_ = reinterpret_cast<Named>(dlsym(library, (provider + suffix).c_str()));
        if (generic_ == nullptr && named_ == nullptr) {
            throw LoadError(file + ": neither _Generic" + suffix + " nor " + provider + suffix);
        }
    }

    MI* call(Broker& broker, const CMPIContext* context) const {
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        MI* const made = callGuarded(broker.cmpi(), context, status);
        if (status.rc != CMPI_RC_OK) {
            throw LoadError(where_ + " answered status " + std::to_string(status.rc) +
                            messageSuffix(status));
        }
        if (made == nullptr) throw LoadError(where_ + " returned null");
        if (made->ft == nullptr) throw LoadError(where_ + " gave no table");
        for (const std::string& finding : checkMiTable(*made->ft)) broker.core().report(finding);
        return made;
    }

  private:
    using Generic = MI* (*)(const CMPIBroker*, const CMPIContext*, const char*, CMPIStatus*);
    using Named = MI* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);

    MI* callGuarded(const CMPIBroker* broker, const CMPIContext* context,
                    CMPIStatus& status) const {
        try {
            if (generic_ != nullptr) return generic_(broker, context, provider_.c_str(), &status);
            return named_(broker, context, &status);
        } catch (const std::exception& exception) {
            throw LoadError(where_ + " threw: " + exception.what());
        }
    }

    std::string where_;
    std::string provider_;
    Generic generic_ = nullptr;
    Named named_ = nullptr;
};

/// Calls cleanup of one interface. False: the provider does not want to be unloaded.
template <class MI>
bool cleanUp(MI* interface, Broker& broker, const CMPIContext* context, bool terminating) {
    if (interface == nullptr || interface->ft->cleanup == nullptr) return true;
    const CMPIStatus status = interface->ft->cleanup(interface, context, terminating);
    const bool refuses = status.rc == CMPI_RC_DO_NOT_UNLOAD || status.rc == CMPI_RC_NEVER_UNLOAD;
    if (!refuses && status.rc != CMPI_RC_OK) {
        broker.core().report("cleanup answered status " + std::to_string(status.rc) +
                             messageSuffix(status));
    }
    return !refuses;
}

}  // namespace

ProviderLibrary::ProviderLibrary(std::string file, Broker& broker, LoadOptions options)
    : file_(std::move(file)), broker_(broker), options_(std::move(options)) {
    load();
}

ProviderLibrary::~ProviderLibrary() {
    try {
        unload(true);
    } catch (...) {
        broker_.core().report("an exception left cleanup of " + file_);
    }
}

void ProviderLibrary::load() {
    if (loaded()) return;
    LibraryHandle handle = openLibrary(file_, options_.global);
    // Factories may already make objects, which have to belong somewhere.
    Request request(broker_);
    const CMPIContext* const context = request.makeContext({}, {});

    ManagementInterfaces made;
    const std::string& provider = options_.providerName;
    if (options_.instance) {
        const Factory<CMPIInstanceMI> factory(handle.get(), file_, provider, "Instance");
        made.instance = factory.call(broker_, context);
    }
    if (options_.association) {
        const Factory<CMPIAssociationMI> factory(handle.get(), file_, provider, "Association");
        made.association = factory.call(broker_, context);
    }
    interfaces_ = made;
    handle_ = handle.release();
}

bool ProviderLibrary::unload(bool terminating) {
    if (!loaded()) return true;
    // The library goes even if cleanup throws.
    LibraryHandle handle(std::exchange(handle_, nullptr));
    const ManagementInterfaces going = std::exchange(interfaces_, {});
    Request request(broker_);
    const CMPIContext* const context = request.makeContext({}, {});
    const bool instanceGoes = cleanUp(going.instance, broker_, context, terminating);
    const bool associationGoes = cleanUp(going.association, broker_, context, terminating);
    if (!terminating && !(instanceGoes && associationGoes)) {
        interfaces_ = going;
        handle_ = handle.release();
        return false;
    }
    return true;
}

UpcallAnswer ProviderLibrary::perform(Broker& broker, const OperationRequest& request) {
    UpcallAnswer answer;
    try {
        static_cast<OperationResult&>(answer) = invoke(interfaces_, broker, request);
    } catch (...) {
        broker.core().report(std::string("an exception left ") + operationName(request.operation) +
                             " of " + file_);
        answer.rc = CMPI_RC_ERR_FAILED;
    }
    return answer;
}

void* ProviderLibrary::symbol(const char* name) const noexcept {
    return loaded() ? dlsym(handle_, name) : nullptr;
}

}  // namespace cmpihost
