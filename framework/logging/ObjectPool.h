#ifndef FRAMEWORK_LOGGING_OBJECT_POOL_H
#define FRAMEWORK_LOGGING_OBJECT_POOL_H

#include <array>
#include <atomic>
#include <cstddef>
#include <memory>

namespace ZBLog {

/// Keeps up to `capacity` idle objects for the next user, so that a steady use allocates nothing.
/// An object in use belongs to its user alone. Without locks, which a child process could inherit
/// locked; any number of threads may use it.
///
/// The pool itself is constant-initialised and is never destroyed: threads that outlive the end of
/// main may still call it.
template <class Object, std::size_t capacity>
class ObjectPool {
  public:
    /// An idle object, or null when there is none.
    std::unique_ptr<Object> take() noexcept {
        for (std::atomic<Object*>& slot : slots_) {
            if (Object* const found = slot.exchange(nullptr)) {
                return std::unique_ptr<Object>(found);
            }
        }
        return nullptr;
    }

    /// Keeps the object if there is room, else destroys it.
    void give(std::unique_ptr<Object> object) noexcept {
        if (closed_) return;
        for (std::atomic<Object*>& slot : slots_) {
            Object* expected = nullptr;
            if (slot.compare_exchange_strong(expected, object.get())) {
                static_cast<void>(object.release());
                return;
            }
        }
    }

    /// Destroys the idle objects; what is given later is destroyed at once.
    void close() noexcept {
        closed_ = true;
        while (take()) {
        }
    }

  private:
    std::array<std::atomic<Object*>, capacity> slots_{};
    std::atomic<bool> closed_{false};
};

}  // namespace ZBLog

#endif
