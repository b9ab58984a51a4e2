#ifndef TESTS_SUPPORT_SIMULATED_HOST_H
#define TESTS_SUPPORT_SIMULATED_HOST_H

#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <variant>

#include "framework/instrumentation/HostSource.h"

namespace VA {

/// A host that answers what it was told to, counts what it was asked, and fails on demand.
///
/// All its nodes are operating system nodes; a walk over another type finds none. Any number of
/// threads may use one host, and change it: a walk keeps the nodes and the computer name as they
/// stood when it was selected.
class SimulatedHost final : public HostSource {
  public:
    /// What this host can be asked: the operations of VA::Instrumentation, its construction
    /// included.
    enum class Operation {
        Construct,
        Select,
        Valid,
        Next,
        ReadText,
        ReadNumber,
        ReadFlag,
        ReadOnlyQuery,
        NodeStatus,
        ComputerName,
    };

    /// The type of a value is the only overload that reads it.
    using Value = std::variant<std::string, unsigned int, bool>;

    struct Node {
        std::map<NodeLexicon::Properties, Value> properties;  ///< a missing one is absent
        std::map<NodeLexicon::Properties, bool> readOnly;     ///< a missing answer is not known
        unsigned int status = 1;
    };

    /// One call, as a hook sees it. Numbers count from 1, since construction or resetCounts().
    struct Call {
        Operation operation;
        std::optional<NodeLexicon::Properties> id;  ///< none where the operation takes none
        std::uint64_t number;                       ///< among all calls
        std::uint64_t numberOfOperation;            ///< among the calls of this operation
    };

    /// Runs after a call was counted and before it is answered, on the caller's thread, with no
    /// lock held. What it throws leaves the call, whatever its type.
    using Hook = std::function<void(const Call&)>;

    SimulatedHost();  ///< no nodes, computer name not known, no hook
    ~SimulatedHost() override;

    /// A host with one plausibleNode() and the computer name "simulated.example".
    static std::shared_ptr<SimulatedHost> withOneNode();

    /// A running node with a value of the right type for every property of NodeLexicon, all
    /// distinct where a mix-up could hide, and property 108 known to be read-only.
    static Node plausibleNode();

    void addNode(Node node);
    void addNodes(Node node, std::size_t count);  ///< equal ones, which share the memory of one
    void clearNodes();
    void setComputerName(std::optional<std::string> name);  ///< nullopt: not known

    void setHook(Hook hook);  ///< an empty one removes it

    /// Makes the n-th call, and every later one, throw a copy of `exception`.
    template <class Exception>
    void throwFromCall(std::uint64_t n, Exception exception) {
        setHook([n, exception](const Call& call) {
            if (call.number >= n) throw exception;
        });
    }

    /// The same, counting the calls of `operation` alone.
    template <class Exception>
    void throwFromCall(Operation operation, std::uint64_t n, Exception exception) {
        setHook([operation, n, exception](const Call& call) {
            if (call.operation == operation && call.numberOfOperation >= n) throw exception;
        });
    }

    std::uint64_t calls() const;
    std::uint64_t calls(Operation operation) const;
    std::uint64_t calls(Operation operation, NodeLexicon::Properties id) const;
    void resetCounts();

    std::unique_ptr<NodeCursor> openCursor() override;

  private:
    class State;
    class Cursor;
    std::shared_ptr<State> state_;
};

}  // namespace VA

#endif
