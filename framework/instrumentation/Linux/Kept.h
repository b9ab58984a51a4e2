#ifndef VA_LINUX_KEPT_H
#define VA_LINUX_KEPT_H

#include <memory>
#include <mutex>
#include <utility>

#include "Kernel.h"
#include "SourceFiles.h"

namespace VA::Linux {

/// What one request leaves for the next. Any number of threads may use it; none waits for another:
/// one that finds it in another's hands gets nothing and leaves nothing. So does, for good, a child
/// of a process that was forked at that moment.
template <class T>
class Slot {
  public:
    /// What was left last; null where nothing was.
    std::shared_ptr<const T> get() {
        const Lock lock(mutex_, std::try_to_lock);
        return lock ? value_ : nullptr;
    }

    void put(std::shared_ptr<const T> value) {
        const Lock lock(mutex_, std::try_to_lock);
        if (lock) value_.swap(value);
    }

  private:
    using Lock = std::unique_lock<std::mutex>;

    std::mutex mutex_;
    std::shared_ptr<const T> value_;
};

/// A value made of files, kept from one request to the next while the files stay as they are. Any
/// number of threads may ask.
template <class T>
class Kept {
  public:
    /// The value that `make(SourceFiles&)` makes of the files as they are now. It is called only
    /// where the value kept does not hold any more. `files` are the same ones in every call, and
    /// outlive this object.
    template <class Make>
    std::shared_ptr<const T> value(const HostFiles& files, const Kernel& kernel, Make make) {
        if (auto kept = slot_.get(); kept && kept->sources.areUnchanged()) {
            return {kept, &kept->value};
        }
        SourceFiles sources(files, kernel.now());
        T value = make(sources);
        auto made = std::make_shared<const Entry>(Entry{std::move(value), std::move(sources)});
        if (made->sources.canBeKept()) slot_.put(made);
        return {made, &made->value};
    }

  private:
    struct Entry {
        T value;
        SourceFiles sources;
    };

    Slot<Entry> slot_;
};

}  // namespace VA::Linux

#endif
