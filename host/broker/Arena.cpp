// Objects live until their request ends, as CMPI has it, and no pointer of a provider may reach
// freed memory: what has ended is emptied and kept for a while.
#include "host/broker/Arena.h"

#include <algorithm>
#include <cstdlib>
#include <new>

namespace cmpihost {

namespace {

/// Of a block without bytes, null and a pointer would both be right; providers expect the pointer.
std::size_t atLeastOne(std::size_t size) noexcept {
    return std::max<std::size_t>(size, 1);
}

}  // namespace

Arena::~Arena() {
    for (void* block : blocks_) std::free(block);
}

void Arena::add(std::unique_ptr<ObjectBase> object) {
    objects_.push_back(std::move(object));
    objects_.back()->setArena(this, objects_.size() - 1);
}

std::unique_ptr<ObjectBase> Arena::release(const ObjectBase& object) noexcept {
    std::unique_ptr<ObjectBase> owned = std::move(objects_[object.index()]);
    owned->retire(Lifetime::Released);
    return owned;
}

void* Arena::mark() {
    // Allocated one by one: the address is the handle that the provider gives back.
    marks_.push_back(std::make_unique<std::size_t>(objects_.size()));
    return marks_.back().get();
}

bool Arena::releaseSince(const void* mark, Objects& retired) {
    const auto found = std::find_if(marks_.begin(), marks_.end(), [mark](const auto& candidate) {
        return candidate.get() == mark;
    });
    if (found == marks_.end()) return false;

    const std::size_t first = **found;
    for (std::size_t i = first; i < objects_.size(); ++i) {
        if (objects_[i] == nullptr) continue;
        objects_[i]->retire(Lifetime::Released);
        retired.push_back(std::move(objects_[i]));
    }
    // Marks that were set later go along: their objects are gone.
    objects_.resize(first);
    marks_.erase(found, marks_.end());
    return true;
}

Objects Arena::endRequest(std::size_t kept) noexcept {
    // The oldest go: what is used too late is most often what was made last.
    const std::size_t surplus = objects_.size() - std::min(objects_.size(), kept);
    objects_.erase(objects_.begin(), objects_.begin() + static_cast<std::ptrdiff_t>(surplus));
    for (const auto& object : objects_) {
        if (object != nullptr) object->retire(Lifetime::RequestEnded);
    }
    for (void* block : blocks_) std::free(block);
    blocks_.clear();
    marks_.clear();
    return std::move(objects_);
}

void* Arena::allocate(std::size_t size) {
    void* block = std::malloc(atLeastOne(size));
    if (block == nullptr) throw std::bad_alloc();
    try {
        blocks_.insert(block);
    } catch (...) {
        std::free(block);
        throw;
    }
    return block;
}

void* Arena::reallocate(void* block, std::size_t size) {
    const auto found = blocks_.find(block);
    if (found == blocks_.end()) return nullptr;
    void* grown = std::realloc(block, atLeastOne(size));
    if (grown == nullptr) return nullptr;
    // The node is reused, so that nothing can throw once the block has moved.
    auto node = blocks_.extract(found);
    node.value() = grown;
    blocks_.insert(std::move(node));
    return grown;
}

bool Arena::free(void* block) noexcept {
    if (blocks_.erase(block) == 0) return false;
    std::free(block);
    return true;
}

void Quarantine::put(std::unique_ptr<ObjectBase>& object) noexcept {
    if (object == nullptr || ring_.empty()) return;
    ring_[next_].swap(object);
    next_ = (next_ + 1) % ring_.size();
}

// Whatever falls out of the ring lies in the argument and is freed after the lock is given up.
void Quarantine::take(Objects objects) noexcept {
    const std::lock_guard<std::mutex> lock(mutex_);
    for (auto& object : objects) put(object);
}

void Quarantine::take(std::unique_ptr<ObjectBase> object) noexcept {
    const std::lock_guard<std::mutex> lock(mutex_);
    put(object);
}

std::size_t Quarantine::size() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return static_cast<std::size_t>(std::count_if(
        ring_.begin(), ring_.end(), [](const auto& object) { return object != nullptr; }));
}

}  // namespace cmpihost
