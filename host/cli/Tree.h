#ifndef HOST_CLI_TREE_H
#define HOST_CLI_TREE_H

#include <functional>
#include <ostream>
#include <string>
#include <vector>

#include "host/broker/Operation.h"
#include "host/mof/Schema.h"

namespace cmpihost {

/// A line of a tree and what hangs on it.
struct TreeNode {
    std::string text;
    std::vector<TreeNode> branches{};
};

/// Draws the node at the margin and its branches below it. Control characters are written out.
void drawTree(const TreeNode& root, std::ostream& stream);

/// Answers an operation, whoever serves its class.
using Ask = std::function<OperationResult(const OperationRequest&)>;

/// An operation of a tree that failed.
struct TreeFailure {
    OperationResult result;
};

/// The computer systems of the host, what is installed and running on each, and the capabilities of
/// that, as answers to requests give it. Without a computer system, the operating systems alone.
/// Throws TreeFailure when an answer has a status other than OK.
std::vector<TreeNode> hostTree(const Ask& ask, const std::string& nameSpace, const Schema& schema);

}  // namespace cmpihost

#endif
