#ifndef VA_INSTRUMENTATION_H
#define VA_INSTRUMENTATION_H

#include <memory>
#include <string>

#include "NodeLexicon.h"

namespace VA {

/// A cursor over the managed nodes of one type, with typed property reads.
///
/// One cursor serves one thread; cursors are independent of each other, and any number of threads
/// may use one each at the same time. The values that one cursor reads from one node belong
/// together: each source behind them is read at most once, when a property first needs it.
///
/// No operation reports an error: what cannot be read is absent. std::bad_alloc may leave any.
class __attribute__((visibility("default"))) Instrumentation {
  public:
    /// A cursor that stands on no node.
    Instrumentation();
    ~Instrumentation();
    Instrumentation(const Instrumentation&) = delete;
    Instrumentation& operator=(const Instrumentation&) = delete;

    /// Selects all nodes of `type` and stands on the first of them; true if there is one.
    /// Called once per cursor, before anything else.
    bool selectNode(NodeLexicon::NodeType type);

    /// True while the cursor stands on a node.
    operator bool();

    /// Moves to the next node of the selected type. Moving past the last one is final.
    Instrumentation& operator++();

    /// Reads a property of the current node into `value`. False when the node has no such value of
    /// that type, or when the cursor stands on no node; `value` is then not to be used.
    bool getProperty(NodeLexicon::Properties id, std::string& value);
    bool getProperty(NodeLexicon::Properties id, unsigned int& value);
    bool getProperty(NodeLexicon::Properties id, bool& value);

    /// Tells in `value` whether property `id` is read-only on the current node. False when that is
    /// not known, or when the cursor stands on no node.
    bool isPropertyReadOnly(NodeLexicon::Properties id, bool& value);

    /// The status code of the current node: 0 unknown, 1 running, 2 and 9 starting, 8 quiesced,
    /// 12 running but offline, 16 disabled, 20 degraded with a failure predicted, 21 to 26
    /// degraded otherwise. 0 when the cursor stands on no node.
    unsigned int getNodeStatus();

    /// Writes the name of the computer that the nodes belong to; false when it is not known.
    bool getComputerName(std::string& name);

  private:
    class State;
    std::unique_ptr<State> state_;
};

}  // namespace VA

#endif
