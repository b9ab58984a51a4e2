// Only what the libraries ask for may fail: the broker, the log of the test and GoogleTest allocate
// through the same operator new, so each call's frames are searched for who asked.
#include "faults/Allocations.h"

#include <link.h>
#include <unwind.h>

#include <algorithm>
#include <array>
#include <atomic>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <new>
#include <unordered_map>

namespace {

struct Range {
    std::uintptr_t begin = 0;
    std::uintptr_t end = 0;
    bool holds(std::uintptr_t address) const { return address >= begin && address < end; }
};

constexpr const char* libraries[] = {"libkorvaosstatusfacade", "libkorzbosstatusprofileprovider",
                                     "libvainstrumentation", "libvaprovider", "libzblog"};

enum class Purpose { None, Fail, Measure };

// Nothing here may allocate.
struct State {
    std::array<Range, 5> libraries{};
    Range program{};
    Purpose purpose = Purpose::None;
    bool andLater = false;
    std::size_t n = 0;
    std::size_t asked = 0;
    std::size_t failed = 0;
    std::size_t peak = 0;
    std::size_t current = 0;
};

State state;
std::atomic<std::size_t> inUse{0};

/// Keeps what it does from being watched itself: unwinding allocates, and so does the record of
/// blocks.
class Pause {
  public:
    Pause() : purpose_(state.purpose) { state.purpose = Purpose::None; }
    ~Pause() { state.purpose = purpose_; }
    Pause(const Pause&) = delete;
    Pause& operator=(const Pause&) = delete;

  private:
    Purpose purpose_;
};

/// The sizes of the blocks that are measured and in use.
std::unordered_map<void*, std::size_t>& blockSizes() {
    static std::unordered_map<void*, std::size_t> sizes;
    return sizes;
}

Range codeOf(const dl_phdr_info& module) {
    Range range;
    for (int index = 0; index < module.dlpi_phnum; ++index) {
        const auto& segment = module.dlpi_phdr[index];
        if (segment.p_type != PT_LOAD || (segment.p_flags & PF_X) == 0) continue;
        range.begin = static_cast<std::uintptr_t>(module.dlpi_addr + segment.p_vaddr);
        range.end = range.begin + static_cast<std::uintptr_t>(segment.p_memsz);
    }
    return range;
}

// The program itself comes first, and without a name.
int noteModule(dl_phdr_info* module, std::size_t, void*) {
    if (module->dlpi_name == nullptr || *module->dlpi_name == '\0') {
        if (state.program.end == 0) state.program = codeOf(*module);
        return 0;
    }
    for (std::size_t index = 0; index < state.libraries.size(); ++index)
        if (std::strstr(module->dlpi_name, libraries[index]) != nullptr)
            state.libraries[index] = codeOf(*module);
    return 0;
}

struct Search {
    unsigned frames = 0;
    bool ofLibrary = false;
};

// The first frame that is neither operator new's own nor the C++ library's has asked.
_Unwind_Reason_Code visitFrame(_Unwind_Context* context, void* data) {
    auto& search = *static_cast<Search*>(data);
    constexpr unsigned own = 2;  // askedByLibrary, operator new
    if (++search.frames <= own) return _URC_NO_REASON;
    const auto address = static_cast<std::uintptr_t>(_Unwind_GetIP(context)) - 1;
    search.ofLibrary = std::any_of(state.libraries.begin(), state.libraries.end(),
                                   [&](const Range& range) { return range.holds(address); });
    const bool found = search.ofLibrary || state.program.holds(address);
    return found ? _URC_END_OF_STACK : _URC_NO_REASON;
}

[[gnu::noinline]] bool askedByLibrary() {
    const Pause pause;
    Search search;
    _Unwind_Backtrace(visitFrame, &search);
    return search.ofLibrary;
}

bool mustFail() {
    if (state.purpose != Purpose::Fail) return false;
    const bool fails = state.andLater ? state.asked >= state.n : state.asked == state.n;
    if (fails) ++state.failed;
    return fails;
}

void recordBlock(void* block, std::size_t size) {
    const Pause pause;
    blockSizes().emplace(block, size);
    state.current += size;
    state.peak = std::max(state.peak, state.current);
}

void forgetBlock(void* block) {
    const Pause pause;
    const auto found = blockSizes().find(block);
    if (found == blockSizes().end()) return;
    state.current -= found->second;
    blockSizes().erase(found);
}

void watch(Purpose purpose) {
    state = State{};
    dl_iterate_phdr(noteModule, nullptr);
    state.purpose = purpose;
}

}  // namespace

namespace allocations {

void failFrom(std::size_t n, bool andLater) {
    watch(Purpose::None);
    state.n = n;
    state.andLater = andLater;
    state.purpose = Purpose::Fail;
}

std::size_t release() {
    state.purpose = Purpose::None;
    return state.failed;
}

void measure() {
    blockSizes().clear();
    watch(Purpose::Measure);
}

Usage measured() {
    state.purpose = Purpose::None;
    return {state.asked, state.peak, state.current};
}

std::size_t blocksInUse() {
    return inUse;
}

}  // namespace allocations

// The other forms of new and delete end in these two.

[[gnu::visibility("default")]] void* operator new(std::size_t size) {
    const bool counted = state.purpose != Purpose::None && askedByLibrary();
    if (counted) {
        ++state.asked;
        if (mustFail()) throw std::bad_alloc();
    }
    void* const block = std::malloc(size == 0 ? 1 : size);
    if (block == nullptr) throw std::bad_alloc();
    ++inUse;
    if (counted && state.purpose == Purpose::Measure) recordBlock(block, size);
    return block;
}

[[gnu::visibility("default")]] void operator delete(void* block) noexcept {
    if (block == nullptr) return;
    --inUse;
    if (state.purpose == Purpose::Measure) forgetBlock(block);
    std::free(block);
}

[[gnu::visibility("default")]] void operator delete(void* block, std::size_t) noexcept {
    operator delete(block);
}
