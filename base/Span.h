#ifndef BASE_SPAN_H
#define BASE_SPAN_H

#include <cstddef>

namespace base {

/// The elements of an array that lies elsewhere and lives longer: what constant tables need of
/// std::span, which C++17 lacks.
template <class Element>
class Span {
  public:
    template <std::size_t size>
    constexpr Span(Element (&elements)[size]) : begin_(elements), end_(elements + size) {}

    constexpr Element* begin() const { return begin_; }
    constexpr Element* end() const { return end_; }

  private:
    Element* begin_;
    Element* end_;
};

}  // namespace base

#endif
