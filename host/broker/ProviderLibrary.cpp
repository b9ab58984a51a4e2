#include "host/broker/ProviderLibrary.h"

#include "host/broker/BrokerCore.h"
#include "host/broker/LibraryFile.h"
#include "host/broker/Manners.h"
#include "host/broker/Request.h"

#include <dlfcn.h>
#include <utility>

namespace cmpihost {

namespace {

struct CloseLibrary {
    void operator()(void* handle) const noexcept { dlclose(handle); }
};
using LibraryHandle = std::unique_ptr<void, CloseLibrary>;

const char* loaderText() noexcept {
    const char* const text = dlerror();
    return text == nullptr ? "unknown reason" : text;
}

LibraryHandle open(const std::string& file, bool global) {
    if (const auto found = examineLibraryFile(file)) throw LoadError(found->problem, found->text);
    LibraryHandle handle(dlopen(file.c_str(), RTLD_NOW | (global ? RTLD_GLOBAL : RTLD_LOCAL)));
    if (handle == nullptr) {
        // The loader starts with the file's own name where the file itself is at fault.
        const std::string text = loaderText();
        const bool absent = text.rfind(file + ": cannot open shared object file", 0) == 0;
        const bool named = text.rfind(file + ": ", 0) == 0;
        throw LoadError(absent ? LoadProblem::FileMissing : LoadProblem::Unresolved,
                        named ? text : file + ": " + text);
    }
    return handle;
}

std::string messageOf(const CMPIStatus& status) {
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
        generic_ = reinterpret_cast<Generic>(dlsym(library, ("_Generic" + suffix).c_str()));
        named_ = reinterpret_cast<Named>(dlsym(library, (provider + suffix).c_str()));
        if (generic_ == nullptr && named_ == nullptr) {
            throw LoadError(LoadProblem::NoFactory,
                            file + ": neither _Generic" + suffix + " nor " + provider + suffix);
        }
    }

    MI* call(Broker& broker, const CMPIContext* context) const {
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        MI* const made = callGuarded(broker.cmpi(), context, status);
        if (status.rc != CMPI_RC_OK) {
            throw LoadError(
                LoadProblem::FactoryFailed,
                where_ + " answered status " + std::to_string(status.rc) + messageOf(status));
        }
        if (made == nullptr) throw LoadError(LoadProblem::FactoryFailed, where_ + " returned null");
        if (made->ft == nullptr) throw LoadError(LoadProblem::NoTable, where_ + " gave no table");
        for (const std::string& complaint : badManners(*made->ft)) broker.core().report(complaint);
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
            throw LoadError(LoadProblem::FactoryFailed, where_ + " threw: " + exception.what());
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
                             messageOf(status));
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
    LibraryHandle handle = open(file_, options_.global);
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

void* ProviderLibrary::symbol(const char* name) const noexcept {
    return loaded() ? dlsym(handle_, name) : nullptr;
}

}  // namespace cmpihost
