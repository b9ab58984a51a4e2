// A list, not a map: keys keep the order in which a path has them, and a path may have a name
// twice.
#include "Moniker.h"

namespace VA {

Moniker::Moniker() = default;
Moniker::~Moniker() = default;
Moniker::Moniker(const Moniker&) = default;
Moniker::Moniker(Moniker&&) noexcept = default;
Moniker& Moniker::operator=(const Moniker&) = default;
Moniker& Moniker::operator=(Moniker&&) noexcept = default;

void Moniker::addKey(std::string name, const std::string& value) {
    if (keys_.empty()) keys_.reserve(usualCount);
    keys_.emplace_back(std::move(name), value);
}

unsigned int Moniker::getKeyCount() const {
    return static_cast<unsigned int>(keys_.size());
}

bool Moniker::selectKey(unsigned int index) {
    if (index >= keys_.size()) return false;
    selected_ = index;
    return true;
}

void Moniker::getName(std::string& name) const {
    if (selected_ < keys_.size()) name = keys_[selected_].first;
}

void Moniker::getValue(std::string& value) const {
    if (selected_ < keys_.size()) value = keys_[selected_].second;
}

}  // namespace VA
