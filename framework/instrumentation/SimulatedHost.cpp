#include "SimulatedHost.h"

#include <mutex>
#include <utility>
#include <vector>

namespace VA {

using NodeLexicon::Properties;

class SimulatedHost::State {
  public:
    /// What a walk sees: a copy, so that changes to the host leave it alone.
    struct View {
        std::vector<Node> nodes;
        std::optional<std::string> computerName;
    };

    View view() const {
        const std::lock_guard<std::mutex> lock(mutex_);
        return view_;
    }

    template <class Change>
    void change(Change change) {
        const std::lock_guard<std::mutex> lock(mutex_);
        change(view_);
    }

    void setHook(Hook hook) {
        const std::lock_guard<std::mutex> lock(mutex_);
        hook_.swap(hook);
    }

    void enter(Operation operation, std::optional<Properties> id = std::nullopt) {
        Call call{operation, id, 0, 0};
        Hook hook;
        {
            const std::lock_guard<std::mutex> lock(mutex_);
            call.number = ++total_;
            call.numberOfOperation = ++perOperation_[operation];
            if (id) ++perProperty_[{operation, *id}];
            hook = hook_;
        }
        if (hook) hook(call);
    }

    std::uint64_t total() const {
        const std::lock_guard<std::mutex> lock(mutex_);
        return total_;
    }

    std::uint64_t count(Operation operation) const { return count(perOperation_, operation); }

    std::uint64_t count(Operation operation, Properties id) const {
        return count(perProperty_, std::pair(operation, id));
    }

    void resetCounts() {
        const std::lock_guard<std::mutex> lock(mutex_);
        total_ = 0;
        perOperation_.clear();
        perProperty_.clear();
    }

  private:
    template <class Key>
    std::uint64_t count(const std::map<Key, std::uint64_t>& counts, const Key& key) const {
        const std::lock_guard<std::mutex> lock(mutex_);
        const auto found = counts.find(key);
        return found == counts.end() ? 0 : found->second;
    }

    mutable std::mutex mutex_;
    View view_;
    Hook hook_;
    std::uint64_t total_ = 0;
    std::map<Operation, std::uint64_t> perOperation_;
    std::map<std::pair<Operation, Properties>, std::uint64_t> perProperty_;
};

class SimulatedHost::Cursor final : public NodeCursor {
  public:
    explicit Cursor(std::shared_ptr<State> state) : state_(std::move(state)) {
        state_->enter(Operation::Construct);
    }

    bool select(NodeLexicon::NodeType type) override {
        state_->enter(Operation::Select);
        view_ = state_->view();
        position_ = 0;
        if (type != NodeLexicon::OperatingSystemNode) view_.nodes.clear();
        return node() != nullptr;
    }

    bool standsOnNode() override {
        state_->enter(Operation::StandsOnNode);
        return node() != nullptr;
    }

    void advance() override {
        state_->enter(Operation::Advance);
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

    bool readOnlyProperty(Properties id, bool& value) override {
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
        if (!view_.computerName) return false;
        name = *view_.computerName;
        return true;
    }

  private:
    const Node* node() const {
        return position_ < view_.nodes.size() ? &view_.nodes[position_] : nullptr;
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
    State::View view_;
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
    using namespace NodeLexicon;
    Node node;
    node.properties = {
        {Name, std::string("Simulated Linux")},
        {OSType, 35u},
        {Version, std::string("12.5")},
        {InstallDate, std::string("2023-06-10-09:08:07")},
        {Distributed, false},
        {LastBootUpTime, std::string("2024-02-29-23:59:58")},
        {MaxNumberOfProcesses, 32768u},
        {MaxProcessMemorySize, 67108864u},
        {NumberOfProcesses, 211u},
        {NumberOfUsers, 3u},
        {NumberOfLicensedUsers, 0u},
        {TotalVirtualMemorySize, 18874368u},
        {FreeVirtualMemory, 13631488u},
        {FreePhysicalMemory, 12058624u},
        {TotalVisibleMemorySize, 16777216u},
        {TotalSwapSpaceSize, 2097152u},
        {SizeStoredInPagingFiles, 2097151u},
        {FreeSpaceInPagingFiles, 1572864u},
    };
    node.readOnly = {{Name, true}};
    return node;
}

void SimulatedHost::addNode(Node node) {
    state_->change([&](State::View& view) { view.nodes.push_back(std::move(node)); });
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
