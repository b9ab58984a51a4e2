#include "host/broker/Arena.h"

#include <algorithm>
#include <cstdlib>
#include <new>

namespace cmpihost {

namespace {

/// Of a block without bytes, null and a pointer would both be right; providers expect the pointer.
std::size_t notNothing(std::size_t size) noexcept {
    return std::max<std::size_t>(size, 1);
}

}  // namespace

Arena::~Arena() {
    for (void* block : blocks_) std::free(block);
}

void Arena::add(std::unique_ptr<Shell> shell) {
    shells_.push_back(std::move(shell));
    shells_.back()->belongTo(this, shells_.size() - 1);
}

std::unique_ptr<Shell> Arena::giveBack(const Shell& shell) noexcept {
    std::unique_ptr<Shell> owned = std::move(shells_[shell.place()]);
    owned->retire(Life::GivenBack);
    return owned;
}

void* Arena::mark() {
    marks_.push_back(std::make_unique<std::size_t>(shells_.size()));
    return marks_.back().get();
}

bool Arena::retireSince(const void* mark, Shells& retired) {
    const auto found = std::find_if(marks_.begin(), marks_.end(), [mark](const auto& candidate) {
        return candidate.get() == mark;
    });
    if (found == marks_.end()) return false;

    const std::size_t first = **found;
    for (std::size_t i = first; i < shells_.size(); ++i) {
        if (shells_[i] == nullptr) continue;
        shells_[i]->retire(Life::GivenBack);
        retired.push_back(std::move(shells_[i]));
    }
    shells_.resize(first);
    marks_.erase(found, marks_.end());
    return true;
}

Shells Arena::retireAll(std::size_t kept) noexcept {
    const std::size_t surplus = shells_.size() - std::min(shells_.size(), kept);
    shells_.erase(shells_.begin(), shells_.begin() + static_cast<std::ptrdiff_t>(surplus));
    for (const auto& shell : shells_) {
        if (shell != nullptr) shell->retire(Life::Ended);
    }
    for (void* block : blocks_) std::free(block);
    blocks_.clear();
    marks_.clear();
    return std::move(shells_);
}

void* Arena::allocate(std::size_t size) {
    void* block = std::malloc(notNothing(size));
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
    void* grown = std::realloc(block, notNothing(size));
    if (grown == nullptr) return nullptr;
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

void Quarantine::keep(std::unique_ptr<Shell>& shell) noexcept {
    if (shell == nullptr || shells_.empty()) return;
    shells_[next_].swap(shell);
    next_ = (next_ + 1) % shells_.size();
}

// Whatever falls out of the ring lies in the argument and is freed after the lock is given up.
void Quarantine::take(Shells shells) noexcept {
    const std::lock_guard<std::mutex> lock(mutex_);
    for (auto& shell : shells) keep(shell);
}

void Quarantine::take(std::unique_ptr<Shell> shell) noexcept {
    const std::lock_guard<std::mutex> lock(mutex_);
    keep(shell);
}

std::size_t Quarantine::size() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return static_cast<std::size_t>(std::count_if(
        shells_.begin(), shells_.end(), [](const auto& shell) { return shell != nullptr; }));
}

}  // namespace cmpihost
