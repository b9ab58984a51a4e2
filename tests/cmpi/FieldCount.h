#pragma once

#include <cstddef>
#include <type_traits>
#include <utility>

namespace cmpi_test {

// Stands for a value of any type in an initialiser.
struct Anything {
    template <class T>
    operator T() const;
};

template <class Record, class Void, class... Fields>
struct CanStartWith : std::false_type {};
template <class Record, class... Fields>
struct CanStartWith<Record, std::void_t<decltype(Record{std::declval<Fields>()...})>, Fields...>
    : std::true_type {};

// Number of members of an aggregate of scalars and records. A union counts as one.
template <class Record, class... Fields>
constexpr std::size_t fieldCount() {
    if constexpr (CanStartWith<Record, void, Fields..., Anything>::value) {
        return fieldCount<Record, Fields..., Anything>();
    } else {
        return sizeof...(Fields);
    }
}

}  // namespace cmpi_test
