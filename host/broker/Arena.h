// The objects of one request, and the shells that remain of them. Internal.
#pragma once

#include "host/broker/Shell.h"

#include <cstddef>
#include <memory>
#include <mutex>
#include <set>
#include <vector>

namespace cmpihost {

using Shells = std::vector<std::unique_ptr<Shell>>;

/// Objects and memory blocks in the order in which they were made. Used by one thread at a time.
class Arena {
  public:
    Arena() = default;
    ~Arena();
    Arena(const Arena&) = delete;
    Arena& operator=(const Arena&) = delete;

    void add(std::unique_ptr<Shell> shell);
    /// Retires one object before its time and hands its shell out.
    std::unique_ptr<Shell> giveBack(const Shell& shell) noexcept;

    /// A mark for what is made from now on; it belongs to the arena.
    void* mark();
    /// Retires what was made since the mark, inner marks included. False: no such mark.
    bool retireSince(const void* mark, Shells& retired);
    /// Ends everything: destroys all objects but the last `kept`, and hands the shells of those
    /// out.
    Shells retireAll(std::size_t kept) noexcept;

    void* allocate(std::size_t size);
    /// Null: the block is none of this arena, or there is no memory.
    void* reallocate(void* block, std::size_t size);
    /// False: the block is none of this arena.
    bool free(void* block) noexcept;

  private:
    Shells shells_;
    std::vector<std::unique_ptr<std::size_t>> marks_;
    std::set<void*> blocks_;
};

/// Shells of ended objects, the oldest given up first. Any thread.
class Quarantine {
  public:
    explicit Quarantine(std::size_t limit) : shells_(limit) {}

    /// Null pointers among them do not count.
    void take(Shells shells) noexcept;
    void take(std::unique_ptr<Shell> shell) noexcept;
    std::size_t size() const;

  private:
    void keep(std::unique_ptr<Shell>& shell) noexcept;

    mutable std::mutex mutex_;
    /// A ring; `next_` is the oldest place.
    Shells shells_;
    std::size_t next_ = 0;
};

}  // namespace cmpihost
