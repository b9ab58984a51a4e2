#ifndef HOST_CLI_TREE_H
#define HOST_CLI_TREE_H

#include <functional>
#include <optional>
#include <ostream>
#include <stdexcept>
#include <string>
#include <vector>

#include "host/broker/Operation.h"
#include "host/cli/Terminal.h"
#include "host/mof/Schema.h"

namespace cmpihost {

/// A line of a tree and what hangs on it.
struct TreeNode {
    std::string text;
    std::vector<TreeNode> branches{};
    /// What the line is about; none: an association, whose far ends are the branches, or a remark.
    std::optional<InstanceValue> element{};
    bool isAssociation = false;
};

/// Draws the node at the margin and its branches below it, with lines where the terminal's locale
/// has them, else with ASCII characters. Control characters are written out.
void drawTree(const TreeNode& root, std::ostream& stream, const Terminal& terminal);

/// Writes the trees as one JSON array. A node has its `label`, its `element`, the `association`
/// that leads to it (none to a root) and its `branches`; associations are no nodes of their own.
void writeTreeJson(const std::vector<TreeNode>& roots, std::ostream& stream, const Schema& schema);

/// Answers an operation, whoever serves its class.
using Ask = std::function<OperationResult(const OperationRequest&)>;

/// An answer with a status other than OK, of which no tree can be drawn; what() is its failureText.
class TreeFailure : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

/// The computer systems of the host, what is installed and running on each, and the capabilities of
/// that, as answers to requests give it. Without a computer system, the operating systems alone.
/// Throws TreeFailure.
std::vector<TreeNode> hostTree(const Ask& ask, const std::string& nameSpace, const Schema& schema);

}  // namespace cmpihost

#endif
