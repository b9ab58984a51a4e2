#ifndef VA_LINUX_LAZY_H
#define VA_LINUX_LAZY_H

#include <optional>

namespace VA::Linux {

/// A value that is made when it is first asked for, and kept.
template <class T>
class Lazy {
  public:
    template <class Make>
    const T& value(Make make) {
        if (!value_) value_.emplace(make());
        return *value_;
    }

  private:
    std::optional<T> value_;
};

}  // namespace VA::Linux

#endif
