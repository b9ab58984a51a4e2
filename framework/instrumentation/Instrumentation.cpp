#include "Instrumentation.h"

#include "HostSource.h"

namespace VA {

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
    return state_->cursor->readOnlyProperty(id, value);
}

unsigned int Instrumentation::getNodeStatus() {
    return state_->cursor->nodeStatus();
}

bool Instrumentation::getComputerName(std::string& name) {
    return state_->cursor->readComputerName(name);
}

}  // namespace VA
