#include "support/SimulatedHost.h"

#include <algorithm>
#include <array>
#include <atomic>
#include <mutex>
#include <utility>
#include <vector>

#include "support/Properties.h"

namespace VA {

using NodeLexicon::Properties;

class SimulatedHost::State {
  public:
    struct View {
        std::vector<std::shared_ptr<const Node>> nodes;
        std::optional<std::string> computerName;
    };

    /// What a walk sees. It never changes: a change to the host makes another one.
    std::shared_ptr<const View> view() const {
        const std::lock_guard<std::mutex> lock(mutex_);
        return view_;
    }

    template <class Change>
    void change(Change change) {
        const std::lock_guard<std::mutex> lock(mutex_);
        const auto changed = std::make_shared<View>(*view_);
        change(*changed);
        view_ = changed;
    }

    void setHook(Hook hook) {
        const std::lock_guard<std::mutex> lock(mutex_);
        hook_.swap(hook);
        hooked_ = static_cast<bool>(hook_);
    }

    void enter(Operation operation, std::optional<Properties> id = std::nullopt) {
        const Call call{operation, id, ++total_, ++countOf(operation)};
        if (id) ++countOf(operation, *id);
        if (hooked_) runHook(call);
    }

    std::uint64_t total() const { return total_; }
    std::uint64_t count(Operation operation) { return countOf(operation); }
    std::uint64_t count(Operation operation, Properties id) { return countOf(operation, id); }

    void resetCounts() {
        total_ = 0;
        for (Count& count : perOperation_) count = 0;
        for (auto& counts : perProperty_)
            for (Count& count : counts) count = 0;
    }

  private:
    using Count = std::atomic<std::uint64_t>;
    static constexpr std::size_t operations = static_cast<std::size_t>(Operation::ComputerName) + 1;
    // Ids past those of the lexicon share the last place.
    static constexpr std::size_t ids = largestPropertyId() + 2;

    Count& countOf(Operation operation) {
        return perOperation_[static_cast<std::size_t>(operation)];
    }
    Count& countOf(Operation operation, Properties id) {
        const auto index = std::min<std::size_t>(static_cast<std::size_t>(id), ids - 1);
        return perProperty_[static_cast<std::size_t>(operation)][index];
    }

    void runHook(const Call& call) {
        Hook hook;
        {
            const std::lock_guard<std::mutex> lock(mutex_);
            hook = hook_;
        }
        if (hook) hook(call);
    }

    mutable std::mutex mutex_;
    std::shared_ptr<const View> view_ = std::make_shared<const View>();
    Hook hook_;
    std::atomic<bool> hooked_{false};
    Count total_{0};
    std::array<Count, operations> perOperation_{};
    std::array<std::array<Count, ids>, operations> perProperty_{};
};

class SimulatedHost::Cursor final : public NodeCursor {
  public:
    explicit Cursor(std::shared_ptr<State> state) : state_(std::move(state)) {
        state_->enter(Operation::Construct);
    }

    bool select(NodeLexicon::NodeType type) override {
        state_->enter(Operation::Select);
        view_ = state_->view();
        hasNodes_ = type == NodeLexicon::OperatingSystemNode;
        position_ = 0;
        return node() != nullptr;
    }

    bool valid() override {
        state_->enter(Operation::Valid);
        return node() != nullptr;
    }

    void next() override {
        state_->enter(Operation::Next);
        ++position_;
    }

    bool readProperty(Properties id, std::string& value) override {
        return read(Operation::ReadText, id, value);
    }

    bool readProperty(Properties id, unsigned int& value) override {
        return read(Operation::ReadNumber, id, value);
    }

    bool readProperty(Properties id, bool& value) override {
        return read(Operation::ReadFlag, id, value);
    }

    bool isPropertyReadOnly(Properties id, bool& value) override {
        state_->enter(Operation::ReadOnlyQuery, id);
        if (!node()) return false;
        const auto found = node()->readOnly.find(id);
        if (found == node()->readOnly.end()) return false;
        value = found->second;
        return true;
    }

    unsigned int nodeStatus() override {
        state_->enter(Operation::NodeStatus);
        return node() ? node()->status : 0;
    }

    bool readComputerName(std::string& name) override {
        state_->enter(Operation::ComputerName);
        if (!view_ || !view_->computerName) return false;
        name = *view_->computerName;
        return true;
    }

  private:
    const Node* node() const {
        if (!hasNodes_ || position_ >= view_->nodes.size()) return nullptr;
        return view_->nodes[position_].get();
    }

    template <class T>
    bool read(Operation operation, Properties id, T& value) {
        state_->enter(operation, id);
        if (!node()) return false;
        const auto found = node()->properties.find(id);
        if (found == node()->properties.end()) return false;
        const T* held = std::get_if<T>(&found->second);
        if (!held) return false;
        value = *held;
        return true;
    }

    const std::shared_ptr<State> state_;
    std::shared_ptr<const State::View> view_;
    bool hasNodes_ = false;
    std::size_t position_ = 0;
};

SimulatedHost::SimulatedHost() : state_(std::make_shared<State>()) {}

SimulatedHost::~SimulatedHost() = default;

std::shared_ptr<SimulatedHost> SimulatedHost::withOneNode() {
    auto host = std::make_shared<SimulatedHost>();
    host->addNode(plausibleNode());
    host->setComputerName("simulated.example");
    return host;
}

SimulatedHost::Node SimulatedHost::plausibleNode() {
    Node node;
    for (const PublishedProperty& property : operatingSystemProperties) {
        if (property.id == 0) continue;
        const std::string text = property.hostText();
        Value& value = node.properties[static_cast<Properties>(property.id)];
        if (property.isText())
            value = text;
        else if (property.isFlag())
            value = text == "true";
        else
            value = static_cast<unsigned int>(std::stoul(text));
    }
    node.readOnly = {{NodeLexicon::Name, true}};
    return node;
}

void SimulatedHost::addNode(Node node) {
    addNodes(std::move(node), 1);
}

void SimulatedHost::addNodes(Node node, std::size_t count) {
    const auto shared = std::make_shared<const Node>(std::move(node));
    state_->change([&](State::View& view) { view.nodes.insert(view.nodes.end(), count, shared); });
}

void SimulatedHost::clearNodes() {
    state_->change([](State::View& view) { view.nodes.clear(); });
}

void SimulatedHost::setComputerName(std::optional<std::string> name) {
    state_->change([&](State::View& view) { view.computerName = std::move(name); });
}

void SimulatedHost::setHook(Hook hook) {
    state_->setHook(std::move(hook));
}

std::uint64_t SimulatedHost::calls() const {
    return state_->total();
}

std::uint64_t SimulatedHost::calls(Operation operation) const {
    return state_->count(operation);
}

std::uint64_t SimulatedHost::calls(Operation operation, Properties id) const {
    return state_->count(operation, id);
}

void SimulatedHost::resetCounts() {
    state_->resetCounts();
}

std::unique_ptr<NodeCursor> SimulatedHost::openCursor() {
    return std::make_unique<Cursor>(state_);
}

}  // namespace VA
