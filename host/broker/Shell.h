// What all objects of a broker have in common. Internal.
#pragma once

#include <array>
#include <cstddef>
#include <string>
#include <string_view>

namespace cmpihost {

class Arena;
class BrokerCore;

enum class Life : unsigned char {
    Alive,
    /// The request that it belonged to has ended.
    Ended,
    /// Given back by the provider: a clone released, an object freed early.
    GivenBack
};

/// An object that a provider may hold a pointer to. Once retired it is an empty shell whose
/// function table reports every use.
class Shell {
  public:
    explicit Shell(BrokerCore& core) noexcept : core_(core) {}
    virtual ~Shell() = default;
    Shell(const Shell&) = delete;
    Shell& operator=(const Shell&) = delete;

    BrokerCore& core() const noexcept { return core_; }
    Life life() const noexcept { return life_; }

    /// The arena of the request that it belongs to and the place in it; null: a clone, the
    /// provider's own.
    Arena* arena() const noexcept { return arena_; }
    std::size_t place() const noexcept { return place_; }
    void belongTo(Arena* arena, std::size_t place) noexcept {
        arena_ = arena;
        place_ = place;
    }

    /// Drops the content; the shell stays.
    virtual void retire(Life why) noexcept = 0;

    /// "CMPIObjectPath of KORVA_X" or the like, alive or retired.
    virtual std::string describe() const = 0;

    /// "used after its request ended" or the like, for a retired one.
    const char* endOfLife() const noexcept;

  protected:
    void remember(Life why, std::string_view label) noexcept;
    std::string_view label() const noexcept { return label_.data(); }

  private:
    BrokerCore& core_;
    Arena* arena_ = nullptr;
    std::size_t place_ = 0;
    Life life_ = Life::Alive;
    std::array<char, 48> label_{};
};

}  // namespace cmpihost
