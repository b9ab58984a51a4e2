// The tree is built from the same requests that a client would send, so that it shows what the
// provider answers and not what the host knows.
#include "host/cli/Tree.h"

#include "host/cli/Diagnostics.h"
#include "host/cli/Json.h"
#include "host/cli/ValueText.h"

namespace cmpihost {

namespace {

constexpr const char* computerSystem = "KORVA_ComputerSystem";
constexpr const char* operatingSystem = "KORVA_OperatingSystem";
constexpr const char* installedOn = "KORVA_InstalledOS";
constexpr const char* runningOn = "KORVA_RunningOS";
constexpr const char* elementCapabilities = "KORVA_OSElementCapabilities";

/// Builds the branches of one host.
class TreeBuilder {
  public:
    TreeBuilder(const Ask& ask, const std::string& nameSpace, const Schema& schema)
        : ask_(ask), nameSpace_(nameSpace), schema_(schema) {}

    std::vector<TreeNode> roots() const {
        std::vector<TreeNode> result;
        for (const InstanceValue& computer : enumerated(computerSystem)) {
            TreeNode root = node(computer, text(computer, "Name"));
            root.branches.push_back(associated(computer, installedOn, &TreeBuilder::installed));
            root.branches.push_back(associated(computer, runningOn, &TreeBuilder::running));
            result.push_back(std::move(root));
        }
        // Associations need a computer to start from; the systems can be shown without.
        if (result.empty()) {
            result.push_back({std::string("no ") + computerSystem + ", so nothing is associated"});
            for (const InstanceValue& system : enumerated(operatingSystem)) {
                result.back().branches.push_back(installed(system));
            }
        }
        return result;
    }

  private:
    using Branch = TreeNode (TreeBuilder::*)(const InstanceValue&) const;

    std::vector<InstanceValue> answered(const OperationRequest& request) const {
        OperationResult result = ask_(request);
        if (result.rc != CMPI_RC_OK) throw TreeFailure(failureText(request, result));
        return std::move(result.instances);
    }

    std::vector<InstanceValue> enumerated(const char* className) const {
        OperationRequest request;
        request.operation = Operation::EnumerateInstances;
        request.path.nameSpace = nameSpace_;
        request.path.className = className;
        return answered(request);
    }

    TreeNode associated(const InstanceValue& source, const char* association, Branch branch) const {
        OperationRequest request;
        request.operation = Operation::Associators;
        request.path = source.path;
        // One association at a time, as the answer does not say which one led to an instance.
        request.assocClass = association;
        TreeNode result{association};
        result.isAssociation = true;
        for (const InstanceValue& farEnd : answered(request)) {
            result.branches.push_back((this->*branch)(farEnd));
        }
        return result;
    }

    TreeNode installed(const InstanceValue& system) const {
        TreeNode result = node(system, text(system, "Name") + " " + text(system, "Version"),
                               ": installed " + moment(system, "InstallDate"));
        result.branches.push_back(
            associated(system, elementCapabilities, &TreeBuilder::capabilities));
        return result;
    }

    /// The state of what runs; what it can do hangs on the installed one, which is the same system.
    TreeNode running(const InstanceValue& system) const {
        return node(system, text(system, "Name") + " " + text(system, "Version"),
                    ": " + named(system, "EnabledState") + ", health " +
                        named(system, "HealthState") + ", up since " +
                        moment(system, "LastBootUpTime"));
    }

    TreeNode capabilities(const InstanceValue& instance) const {
        const Value* editable = instance.property("ElementNameEditSupported");
        const char* name = editable == nullptr || editable->isNull() ? "not known"
                           : editable->boolean()                     ? "editable"
                                                                     : "fixed";
        return node(instance, text(instance, "InstanceID"),
                    std::string(": name ") + name +
                        ", shutdown of the host: " + named(instance, "HostShutdownBehavior"));
    }

    static TreeNode node(const InstanceValue& instance, const std::string& label,
                         const std::string& remark = {}) {
        return {label + " (" + instance.path.className + ")" + remark, {}, instance};
    }

    static std::string text(const InstanceValue& instance, const char* property) {
        const Value* value = instance.property(property);
        return value == nullptr || value->isNull() ? "(not known)" : value->toText();
    }

    /// The name of a number by the schema, else the number.
    std::string named(const InstanceValue& instance, const char* property) const {
        const Value* value = instance.property(property);
        if (value == nullptr || value->isNull()) return "(not known)";
        const std::string* name =
            nameOf(*value, schema_.valueMap(instance.path.className, property));
        return name == nullptr ? value->toText() : *name;
    }

    static std::string moment(const InstanceValue& instance, const char* property) {
        const std::string cimText = text(instance, property);
        const std::string readable = humanReadableDateTime(cimText);
        return readable.empty() ? cimText : readable;
    }

    const Ask& ask_;
    const std::string& nameSpace_;
    const Schema& schema_;
};

/// What stands before a branch, and before the lines of what hangs on it.
struct Lines {
    const char* branch;
    const char* lastBranch;
    const char* below;
    const char* belowLast;
};

constexpr Lines drawnLines = {"├── ", "└── ", "│   ", "    "};
constexpr Lines typedLines = {"|-- ", "`-- ", "|   ", "    "};

/// A text on the lines that the terminal has room for beside the margin: all but the first begin
/// with the margin and what leads to the branches below.
std::string wrapped(const std::string& text, const std::string& margin, const char* hanging,
                    const Terminal& terminal) {
    const std::size_t taken = columnsOf(margin) + columnsOf(hanging);
    const std::size_t room = terminal.width > taken ? terminal.width - taken : 0;
    std::string result = wrap(terminal.shown(text), room);
    const std::string lineEnd = '\n' + margin + hanging;
    for (std::size_t at = result.find('\n'); at != std::string::npos;
         at = result.find('\n', at + lineEnd.size())) {
        result.replace(at, 1, lineEnd);
    }
    return result;
}

void drawBranches(const TreeNode& node, const std::string& margin, std::ostream& stream,
                  const Terminal& terminal) {
    const Lines& lines = terminal.utf8 ? drawnLines : typedLines;
    for (std::size_t index = 0; index < node.branches.size(); ++index) {
        const bool last = index + 1 == node.branches.size();
        const TreeNode& branch = node.branches[index];
        const std::string below = margin + (last ? lines.belowLast : lines.below);
        const char* const hanging = branch.branches.empty() ? "" : lines.below;
        stream << margin << (last ? lines.lastBranch : lines.branch)
               << wrapped(branch.text, below, hanging, terminal) << '\n';
        drawBranches(branch, below, stream, terminal);
    }
}

JsonValue nodeJson(const TreeNode& node, const std::string& association, const Schema& schema);

void addNodes(JsonValue& list, const TreeNode& node, const std::string& association,
              const Schema& schema) {
    for (const TreeNode& branch : node.branches) {
        if (branch.isAssociation) {
            addNodes(list, branch, branch.text, schema);
        } else {
            list.push_back(nodeJson(branch, association, schema));
        }
    }
}

JsonValue nodeJson(const TreeNode& node, const std::string& association, const Schema& schema) {
    JsonValue object = {{"label", node.text}};
    if (!association.empty()) object["association"] = association;
    if (node.element) object["element"] = instanceJson(*node.element, schema);
    JsonValue branches = JsonValue::array();
    addNodes(branches, node, {}, schema);
    object["branches"] = std::move(branches);
    return object;
}

}  // namespace

void drawTree(const TreeNode& root, std::ostream& stream, const Terminal& terminal) {
    stream << terminal.shown(root.text) << '\n';
    drawBranches(root, "", stream, terminal);
}

void writeTreeJson(const std::vector<TreeNode>& roots, std::ostream& stream, const Schema& schema) {
    JsonValue list = JsonValue::array();
    for (const TreeNode& root : roots) list.push_back(nodeJson(root, {}, schema));
    writeJson(list, stream);
}

std::vector<TreeNode> hostTree(const Ask& ask, const std::string& nameSpace, const Schema& schema) {
    return TreeBuilder(ask, nameSpace, schema).roots();
}

}  // namespace cmpihost
