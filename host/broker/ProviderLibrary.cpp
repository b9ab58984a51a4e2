// An object manager calls factories while a request is open and closes a library only after cleanup
// of all its interfaces; a provider that behaves under one of them is loaded and left in the same
// order here.
#include "host/broker/ProviderLibrary.h"

#include "host/broker/BrokerCore.h"
#include "host/broker/Invoke.h"
#include "host/broker/RequestScope.h"

#include "base/Ascii.h"

#include <dlfcn.h>
#include <link.h>

#include <memory>
#include <utility>

namespace cmpihost {

namespace {

struct CloseLibrary {
    void operator()(void* handle) const noexcept { dlclose(handle); }
};
using LibraryHandle = std::unique_ptr<void, CloseLibrary>;

/// Opens a library, with its symbols in the global scope or not. Throws LoadError.
LibraryHandle openLibrary(const std::string& file, bool global) {
    examineLibrary(file);
    LibraryHandle handle(dlopen(file.c_str(), RTLD_NOW | (global ? RTLD_GLOBAL : RTLD_LOCAL)));
    if (handle == nullptr) {
        const char* const reason = dlerror();
        const std::string text = reason == nullptr ? "unknown reason" : reason;
        // The loader starts with the file's own name where the file itself is at fault.
        const bool named = text.rfind(file + ": ", 0) == 0;
        throw LoadError(named ? text : file + ": " + text);
    }
    return handle;
}

/// The file that the loader took for a name; the name where it does not tell.
std::string loadedFile(void* handle, const std::string& name) {
    const link_map* map = nullptr;
    const bool known = dlinfo(handle, RTLD_DI_LINKMAP, &map) == 0 && map->l_name != nullptr;
    return known && *map->l_name != '\0' ? map->l_name : name;
}

/// "foo" of "/folder/libfoo.so.1".
std::string stemOf(const std::string& file) {
    std::string name = file.substr(file.rfind('/') + 1);
    if (name.compare(0, 3, "lib") == 0) name.erase(0, 3);
    return name.substr(0, name.find(".so"));
}

/// The kinds of interfaces that are made if there are factories of them.
std::vector<Interface> wantedInterfaces(const LoadOptions& options) {
    std::vector<Interface> wanted = {Interface::Method, Interface::Property};
    if (options.instance) wanted.push_back(Interface::Instance);
    if (options.association) wanted.push_back(Interface::Association);
    return wanted;
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
    provider_ = options_.providerName;
    if (provider_.empty()) {
        provider_ = cmpihost::providerName(
            file_, exportedFunctions(loadedFile(handle.get(), file_)), stemOf(file_));
    }
    // Factories may already make objects, which have to belong somewhere.
    RequestScope request(broker_);
    std::vector<NamedValue> entries;
    if (options_.parameters) entries.push_back({"sfcbProviderParameters", *options_.parameters});
    const CMPIContext* const context = request.makeContext({}, {}, entries);
    interfaces_ = makeInterfaces({handle.get(), file_, provider_}, broker_, context,
                                 wantedInterfaces(options_));
    // Only now: when a factory throws, the library is closed and nothing points into it.
    handle_ = handle.release();
}

bool ProviderLibrary::unload(bool terminating) {
    if (!loaded()) return true;
    // The library goes even if cleanup throws.
    LibraryHandle handle(std::exchange(handle_, nullptr));
    const ManagementInterfaces going = std::exchange(interfaces_, {});
    RequestScope request(broker_);
    const CMPIContext* const context = request.makeContext({}, {});
    const bool goes = cleanUp(going, broker_, context, terminating);
    if (!terminating && !goes) {
        interfaces_ = going;
        handle_ = handle.release();
        return false;
    }
    return true;
}

std::string ProviderLibrary::whyMissing(Interface which) const {
    std::string kind = interfaceName(which);
    kind.front() = base::toLower(kind.front());
    return file_.substr(file_.rfind('/') + 1) + " has no " + kind + " interface: it exports no " +
           factoryName(provider_, which);
}

UpcallAnswer ProviderLibrary::perform(Broker& broker, const OperationRequest& request) {
    UpcallAnswer answer;
    try {
        static_cast<OperationResult&>(answer) = invoke(*this, broker, request);
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
