// Counts below the C library's own functions: whatever a request allocates or opens, through
// whichever library, is seen.
#include "bench/Counts.h"

#include <dirent.h>
#include <dlfcn.h>
#include <fcntl.h>
#include <malloc.h>

#include <atomic>
#include <cstdarg>

// The C library's own allocator, under its other names.
extern "C" {
void* __libc_malloc(std::size_t size);
void* __libc_calloc(std::size_t count, std::size_t size);
void* __libc_realloc(void* block, std::size_t size);
void* __libc_memalign(std::size_t alignment, std::size_t size);
void __libc_free(void* block);
}

namespace bench {
namespace {

std::atomic<std::size_t> allocationCount{0};
std::atomic<std::size_t> openedCount{0};
std::atomic<bool> watching{false};
std::atomic<long> inUse{0};  // since the watch began: less than nothing when older memory is freed
std::atomic<long> mostInUse{0};

constexpr auto relaxed = std::memory_order_relaxed;

void* counted(void* block) noexcept {
    if (!watching.load(relaxed)) return block;
    allocationCount.fetch_add(1, relaxed);
    const auto size = static_cast<long>(malloc_usable_size(block));
    const long now = inUse.fetch_add(size, relaxed) + size;
    if (now > mostInUse.load(relaxed)) mostInUse.store(now, relaxed);
    return block;
}

void forget(void* block) noexcept {
    if (watching.load(relaxed))
        inUse.fetch_sub(static_cast<long>(malloc_usable_size(block)), relaxed);
}

void countOpened() noexcept {
    if (watching.load(relaxed)) openedCount.fetch_add(1, relaxed);
}

template <class Function>
Function original(Function, const char* name) {
    return reinterpret_cast<Function>(dlsym(RTLD_NEXT, name));
}

}  // namespace

Watch::Watch() noexcept {
    allocationCount = 0;
    openedCount = 0;
    inUse = 0;
    mostInUse = 0;
    watching = true;
}

Watch::~Watch() {
    watching = false;
}

Counts Watch::counts() const noexcept {
    return {allocationCount, openedCount, static_cast<std::size_t>(mostInUse)};
}

}  // namespace bench

extern "C" {

[[gnu::visibility("default")]] void* malloc(std::size_t size) {
    return bench::counted(__libc_malloc(size));
}

[[gnu::visibility("default")]] void* calloc(std::size_t count, std::size_t size) {
    return bench::counted(__libc_calloc(count, size));
}

[[gnu::visibility("default")]] void* realloc(void* block, std::size_t size) {
    bench::forget(block);
    return bench::counted(__libc_realloc(block, size));
}

[[gnu::visibility("default")]] void* memalign(std::size_t alignment, std::size_t size) {
    return bench::counted(__libc_memalign(alignment, size));
}

[[gnu::visibility("default")]] void* aligned_alloc(std::size_t alignment, std::size_t size) {
    return bench::counted(__libc_memalign(alignment, size));
}

[[gnu::visibility("default")]] void free(void* block) {
    bench::forget(block);
    __libc_free(block);
}

// With 64-bit file offsets, both spellings are this function.
[[gnu::visibility("default")]] int open64(const char* path, int flags, ...) {
    static const auto next = bench::original(&::open64, "open64");
    std::va_list rest;
    va_start(rest, flags);
    const mode_t mode = va_arg(rest, mode_t);
    va_end(rest);
    bench::countOpened();
    return next(path, flags, mode);
}

[[gnu::visibility("default")]] DIR* opendir(const char* path) {
    static const auto next = bench::original(&::opendir, "opendir");
    bench::countOpened();
    return next(path);
}
}
