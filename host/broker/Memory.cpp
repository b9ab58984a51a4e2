// CMPIBrokerMemFT: memory of the request, and objects freed before its end.
#include "host/broker/Conversion.h"

#include <cstring>
#include <limits>

namespace cmpihost {

namespace {

CMPIGcStat* mark(BrokerCore& core, CMPIStatus*) {
    return core.withArena([](Arena& arena) { return arena.mark(); });
}

CMPIStatus releaseSince(BrokerCore& core, const CMPIGcStat* gc) {
    Objects retired;
    if (!core.withArena([&](Arena& arena) { return arena.releaseSince(gc, retired); })) {
        core.report("CMPIBrokerMemFT.release without its mark");
        return statusOf(CMPI_RC_ERR_INVALID_HANDLE);
    }
    core.quarantine(std::move(retired));
    return statusOf(CMPI_RC_OK);
}

void* allocate(BrokerCore& core, std::size_t size) {
    return core.withArena([size](Arena& arena) { return arena.allocate(size); });
}

void* allocateZeroed(BrokerCore& core, std::size_t count, std::size_t size) {
    // As calloc would: the product may be too large for a size.
    if (size != 0 && count > std::numeric_limits<std::size_t>::max() / size) return nullptr;
    return std::memset(allocate(core, count * size), 0, count * size);
}

void* reallocate(BrokerCore& core, void* block, std::size_t size) {
    if (block == nullptr) return allocate(core, size);
    return core.withArena([=](Arena& arena) { return arena.reallocate(block, size); });
}

char* duplicate(BrokerCore& core, const CallName& call, const char* text) {
    const std::size_t size = std::strlen(required(core, text, call, "text")) + 1;
    return static_cast<char*>(std::memcpy(allocate(core, size), text, size));
}

void freeBlock(BrokerCore& core, void* block) {
    if (block == nullptr) return;
    if (!core.withArena([block](Arena& arena) { return arena.free(block); })) {
        core.report("CMPIBrokerMemFT.cmpiFree of memory that is none of the request");
    }
}

template <class Edt>
void freeObject(BrokerCore& core, const CallName& call, Edt* handle) {
    core.releaseObject(fromHandle(handle, call));
}

/// No call of this broker makes one, so whatever comes here was made by somebody else.
void freeSelectExp(BrokerCore&, const CallName& call, CMPISelectExp* handle) {
    refuseNeverMade(handle, call, "CMPISelectExp");
}

CMPIBrokerMemFT completeMemory() {
    using FT = CMPIBrokerMemFT;
    FT table{};
    table.ftVersion = CMPICurrentVersion;
    bind<&FT::mark, &mark>(table, "mark");
    bind<&FT::release, &releaseSince>(table, "release");
    bind<&FT::cmpiMalloc, &allocate>(table, "cmpiMalloc");
    bind<&FT::cmpiCalloc, &allocateZeroed>(table, "cmpiCalloc");
    bind<&FT::cmpiRealloc, &reallocate>(table, "cmpiRealloc");
    bind<&FT::cmpiStrDup, &duplicate>(table, "cmpiStrDup");
    bind<&FT::cmpiFree, &freeBlock>(table, "cmpiFree");
    bind<&FT::freeInstance, &freeObject<CMPIInstance>>(table, "freeInstance");
    bind<&FT::freeObjectPath, &freeObject<CMPIObjectPath>>(table, "freeObjectPath");
    bind<&FT::freeArgs, &freeObject<CMPIArgs>>(table, "freeArgs");
    bind<&FT::freeString, &freeObject<CMPIString>>(table, "freeString");
    bind<&FT::freeArray, &freeObject<CMPIArray>>(table, "freeArray");
    bind<&FT::freeDateTime, &freeObject<CMPIDateTime>>(table, "freeDateTime");
    bind<&FT::freeSelectExp, &freeSelectExp>(table, "freeSelectExp");
    return table;
}

}  // namespace

CMPIBrokerMemFT memoryTable() {
    static const CMPIBrokerMemFT complete = completeMemory();
    return complete;
}

}  // namespace cmpihost
