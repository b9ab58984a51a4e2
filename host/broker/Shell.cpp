#include "host/broker/Shell.h"

#include "host/broker/Kinds.h"

#include <algorithm>
#include <cstring>

namespace cmpihost {

const char* Shell::endOfLife() const noexcept {
    return life_ == Life::GivenBack ? "used after it was released" : "used after its request ended";
}

void Shell::remember(Life why, std::string_view label) noexcept {
    life_ = why;
    arena_ = nullptr;
    const std::size_t length = std::min(label.size(), label_.size() - 1);
    std::copy_n(label.data(), length, label_.data());
    label_[length] = '\0';
}

Characters::Characters(const char* text) {
    if (text != nullptr) *this = Characters(std::string_view(text));
}

Characters::Characters(std::string_view text) : text_(new char[text.size() + 1]) {
    std::copy(text.begin(), text.end(), text_.get());
    text_[text.size()] = '\0';
}

}  // namespace cmpihost
