// An object manager calls factories while a request is open and closes a library only after cleanup
// of all its interfaces; a provider that behaves under one of them is loaded and left in the same
// order here.
#include "host/broker/ProviderLibrary.h"

#include "host/broker/BrokerCore.h"
#include "host/broker/Invoke.h"
#include "host/broker/RequestScope.h"

#include <dlfcn.h>
#include <link.h>

#include <cerrno>
#include <cstdint>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <initializer_list>
#include <memory>
#include <system_error>
#include <utility>

namespace cmpihost {

namespace {

namespace fs = std::filesystem;

constexpr bool is64Bit = sizeof(void*) == 8;
constexpr int ownClass = is64Bit ? ELFCLASS64 : ELFCLASS32;

/// The front of the header, which is the same in both word sizes.
struct ElfStart {
    unsigned char ident[EI_NIDENT];
    Elf32_Half type;
    Elf32_Half machine;
};

/// Fills `value` from that place of the file; false when the file ends before.
template <class Record>
bool readAt(std::istream& stream, std::uint64_t offset, Record& value) {
    stream.clear();
    stream.seekg(static_cast<std::streamoff>(offset));
    stream.read(reinterpret_cast<char*>(&value), sizeof value);
    return stream.gcount() == sizeof value;
}

bool liesWithin(std::uint64_t offset, std::uint64_t size, std::uint64_t fileSize) {
    return size <= fileSize && offset <= fileSize - size;
}

/// Whether the file has every byte that the loader maps. Touching one that it lacks ends a process.
bool isWhole(std::istream& stream, std::uint64_t fileSize) {
    ElfW(Ehdr) header{};
    if (!readAt(stream, 0, header)) return false;
    for (std::uint64_t index = 0; index < header.e_phnum; ++index) {
        ElfW(Phdr) segment{};
        const std::uint64_t offset = header.e_phoff + index * sizeof segment;
        if (!readAt(stream, offset, segment)) return false;
        if (segment.p_type == PT_LOAD &&
            !liesWithin(segment.p_offset, segment.p_filesz, fileSize)) {
            return false;
        }
    }
    return true;
}

/// Throws LoadError for a file that is no library of this process. The dynamic loader says little
/// about one, and maps one that is cut off, so that its first use ends the process.
void examine(const std::string& file) {
    // A name without folder is searched by the loader.
    if (file.find('/') == std::string::npos) return;

    // Opening a named pipe would wait for its other end.
    std::error_code error;
    const fs::file_status status = fs::status(file, error);
    if (fs::exists(status) && !fs::is_regular_file(status)) {
        throw LoadError(file + ": " + "not a regular file");
    }
    std::ifstream stream(file, std::ios::binary);
    if (!stream) {
        const std::error_code reason(errno, std::generic_category());
        throw LoadError(file + ": " + reason.message());
    }
    ElfStart start{};
    const bool isElf = readAt(stream, 0, start) && std::memcmp(start.ident, ELFMAG, SELFMAG) == 0 &&
                       start.type == ET_DYN;
    if (!isElf) throw LoadError(file + ": " + "not a shared library");
    if (start.ident[EI_CLASS] != ownClass) {
        throw LoadError(file + ": " + std::string("a ") + (is64Bit ? "32" : "64") +
                        "-bit library, this host is " + (is64Bit ? "64" : "32") + "-bit");
    }
    const std::uintmax_t size = fs::file_size(file, error);
    if (error || !isWhole(stream, size)) throw LoadError(file + ": " + "the file is cut off");
}

struct CloseLibrary {
    void operator()(void* handle) const noexcept { dlclose(handle); }
};
using LibraryHandle = std::unique_ptr<void, CloseLibrary>;

/// Opens a library, with its symbols in the global scope or not. Throws LoadError.
LibraryHandle openLibrary(const std::string& file, bool global) {
    examine(file);
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
        // The generic one comes first, as it alone learns which provider is meant.
        generic_ = reinterpret_cast<Generic>(dlsym(library, ("_Generic" + suffix).c_str()));
        named_ = reinterpret_cast<Named>(dlsym(library, (provider + suffix).c_str()));
        if (generic_ == nullptr && named_ == nullptr) {
            throw LoadError(file + ": neither _Generic" + suffix + " nor " + provider + suffix);
        }
    }

    MI* call(Broker& broker, const CMPIContext* context) const {
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        MI* const made = callFactory(broker.cmpi(), context, status);
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

    MI* callFactory(const CMPIBroker* broker, const CMPIContext* context,
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
    RequestScope request(broker_);
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
    // Only now: when a factory throws, the library is closed and nothing points into it.
    interfaces_ = made;
    handle_ = handle.release();
}

bool ProviderLibrary::unload(bool terminating) {
    if (!loaded()) return true;
    // The library goes even if cleanup throws.
    LibraryHandle handle(std::exchange(handle_, nullptr));
    const ManagementInterfaces going = std::exchange(interfaces_, {});
    RequestScope request(broker_);
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
