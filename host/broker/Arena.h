#ifndef HOST_BROKER_ARENA_H
#define HOST_BROKER_ARENA_H

#include "host/broker/Object.h"

#include <cstddef>
#include <memory>
#include <mutex>
#include <set>
#include <vector>

/// Who owns the objects of a request, while it runs and after it. Internal.
namespace cmpihost {

using Objects = std::vector<std::unique_ptr<ObjectBase>>;

/// Objects and memory blocks of one request in the order in which they were made. Used by one
/// thread at a time.
class Arena {
  public:
    Arena() = default;
    ~Arena();
    Arena(const Arena&) = delete;
    Arena& operator=(const Arena&) = delete;

    void add(std::unique_ptr<ObjectBase> object);
    /// Retires one object before its time and hands it out.
    std::unique_ptr<ObjectBase> release(const ObjectBase& object) noexcept;

    /// A mark for what is made from now on; it belongs to the arena.
    void* mark();
    /// Retires what was made since the mark, inner marks included. False: no such mark.
    bool releaseSince(const void* mark, Objects& retired);
    /// Ends everything: destroys all objects but the last `kept`, and hands those out, retired.
    Objects endRequest(std::size_t kept) noexcept;

    void* allocate(std::size_t size);
    /// Returns null if the block does not belong to this arena or there is no memory.
    void* reallocate(void* block, std::size_t size);
    /// Returns false if the block does not belong to this arena.
    bool free(void* block) noexcept;

  private:
    Objects objects_;
    std::vector<std::unique_ptr<std::size_t>> marks_;
    std::set<void*> blocks_;
};

/// Retired objects, the oldest destroyed first, so that a late use of one is recognised and not a
/// use of freed memory. Any thread.
class Quarantine {
  public:
    explicit Quarantine(std::size_t limit) : ring_(limit) {}

    /// Null pointers among them do not count.
    void take(Objects objects) noexcept;
    void take(std::unique_ptr<ObjectBase> object) noexcept;
    std::size_t size() const;

  private:
    void put(std::unique_ptr<ObjectBase>& object) noexcept;

    mutable std::mutex mutex_;
    /// `next_` is the oldest place.
    Objects ring_;
    std::size_t next_ = 0;
};

}  // namespace cmpihost

#endif
