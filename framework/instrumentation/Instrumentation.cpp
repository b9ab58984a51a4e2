// The contract's class, and which host it reads: the one that was set last. A reader keeps its
// source alive, even after another was set.
#include "Instrumentation.h"

#include <mutex>
#include <utility>

#include "HostSource.h"

namespace VA {

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

NodeCursor::NodeCursor() = default;
NodeCursor::~NodeCursor() = default;
HostSource::HostSource() = default;
HostSource::~HostSource() = default;

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

class Instrumentation::State {
  public:
    // In this order: a cursor must not outlive its source.
    const std::shared_ptr<HostSource> source = currentHostSource();
    const std::unique_ptr<NodeCursor> cursor = source->openCursor();
};

Instrumentation::Instrumentation() : state_(std::make_unique<State>()) {}

Instrumentation::~Instrumentation() = default;

bool Instrumentation::selectNode(NodeLexicon::NodeType type) {
    return state_->cursor->select(type);
}

Instrumentation::operator bool() {
    return state_->cursor->valid();
}

Instrumentation& Instrumentation::operator++() {
    state_->cursor->next();
    return *this;
}

bool Instrumentation::getProperty(NodeLexicon::Properties id, std::string& value) {
    return state_->cursor->readProperty(id, value);
}

bool Instrumentation::getProperty(NodeLexicon::Properties id, unsigned int& value) {
    return state_->cursor->readProperty(id, value);
}

bool Instrumentation::getProperty(NodeLexicon::Properties id, bool& value) {
    return state_->cursor->readProperty(id, value);
}

bool Instrumentation::isPropertyReadOnly(NodeLexicon::Properties id, bool& value) {
    return state_->cursor->isPropertyReadOnly(id, value);
}

unsigned int Instrumentation::getNodeStatus() {
    return state_->cursor->nodeStatus();
}

bool Instrumentation::getComputerName(std::string& name) {
    return state_->cursor->readComputerName(name);
}

}  // namespace VA
