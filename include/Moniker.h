#ifndef VA_MONIKER_H
#define VA_MONIKER_H

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

namespace VA {

/// The framework's identity of a managed element, apart from CMPI: an ordered list of keys, each a
/// name and a text, and a cursor that selects one of them.
///
/// A plain value: copies are independent. One object serves one thread at a time. Operations that
/// copy texts may throw std::bad_alloc.
class __attribute__((visibility("default"))) Moniker {
  public:
    /// An empty moniker; no key is selected.
    Moniker();
    ~Moniker();
    Moniker(const Moniker&);
    Moniker(Moniker&&) noexcept;
    Moniker& operator=(const Moniker&);
    Moniker& operator=(Moniker&&) noexcept;

    /// Appends a key; a name that is there already is appended once more. The selection stays.
    void addKey(std::string name, const std::string& value);

    /// Number of keys.
    unsigned int getKeyCount() const;

    /// Selects the key at `index`, counted from 0. False, and the selection stays, if there is
    /// none.
    bool selectKey(unsigned int index);

    /// Writes name or value of the selected key; writes nothing when no key is selected.
    void getName(std::string& name) const;
    void getValue(std::string& value) const;

  private:
    static constexpr std::size_t none = static_cast<std::size_t>(-1);
    static constexpr std::size_t usualCount = 4;

    std::vector<std::pair<std::string, std::string>> keys_;
    std::size_t selected_ = none;
};

}  // namespace VA

#endif
