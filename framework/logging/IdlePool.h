#ifndef ZBLOG_IDLE_POOL_H
#define ZBLOG_IDLE_POOL_H

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <memory>

namespace ZBLog {

/// Keeps up to `Places` idle objects for the next user, so that a steady use allocates nothing. An
/// object in use belongs to its user alone. Without locks; any number of threads may use it.
///
/// The pool itself is constant-initialised and is never destroyed: threads that outlive the end of
/// main may still call it.
template <class Object, std::size_t Places>
class IdlePool {
  public:
    /// An idle object, or null when there is none.
    std::unique_ptr<Object> take() noexcept {
        const std::size_t start = startOfThisThread();
        for (std::size_t step = 0; step < Places; ++step) {
            std::atomic<Object*>& place = places_[(start + step) % Places].object;
            if (Object* const found = place.exchange(nullptr, std::memory_order_acquire)) {
                return std::unique_ptr<Object>(found);
            }
        }
        return nullptr;
    }

    /// Keeps the object if there is room, else destroys it.
    void give(std::unique_ptr<Object> object) noexcept {
        if (closed_.load(std::memory_order_relaxed)) return;
        const std::size_t start = startOfThisThread();
        for (std::size_t step = 0; step < Places; ++step) {
            std::atomic<Object*>& place = places_[(start + step) % Places].object;
            Object* expected = nullptr;
            if (place.compare_exchange_strong(expected, object.get(), std::memory_order_release)) {
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
    /// Threads begin at different places, told apart by where their stacks lie, so that they seldom
    /// meet at one.
    static std::size_t startOfThisThread() noexcept {
        const char here = 0;
        const auto page = static_cast<std::uint32_t>(reinterpret_cast<std::uintptr_t>(&here) >> 16);
        return (page * 2654435761u >> 16) % Places;
    }

    /// A place has a cache line of its own.
    struct alignas(64) Place {
        std::atomic<Object*> object{nullptr};
    };

    std::array<Place, Places> places_{};
    std::atomic<bool> closed_{false};
};

}  // namespace ZBLog

#endif
