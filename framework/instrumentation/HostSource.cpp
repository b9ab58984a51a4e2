#include "HostSource.h"

#include <mutex>
#include <utility>

namespace VA {

NodeCursor::NodeCursor() = default;
NodeCursor::~NodeCursor() = default;
HostSource::HostSource() = default;
HostSource::~HostSource() = default;

namespace {

// Null until the first use: loading the library does nothing.
struct CurrentSource {
    std::mutex mutex;
    std::shared_ptr<HostSource> source;

    // Emptied under the lock: an object manager may exit while its worker threads still run.
    ~CurrentSource() {
        const std::lock_guard<std::mutex> lock(mutex);
        source.reset();
    }
};

CurrentSource current;

}  // namespace

void setHostSource(std::shared_ptr<HostSource> source) {
    {
        const std::lock_guard<std::mutex> lock(current.mutex);
        current.source.swap(source);
    }
    // The previous source dies here, outside the lock: its destructor may be anybody's code.
}

std::shared_ptr<HostSource> currentHostSource() {
    const std::lock_guard<std::mutex> lock(current.mutex);
    if (!current.source) current.source = makeLinuxHost();
    return current.source;
}

}  // namespace VA
