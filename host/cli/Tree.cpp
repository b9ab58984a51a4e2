// The tree is built from the same requests that a client would send, so that it shows what the
// provider answers and not what the host knows.
#include "host/cli/Tree.h"

#include "base/Utf8.h"
#include "host/cli/Diagnostics.h"
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
            TreeNode root{labelled(computer, text(computer, "Name"))};
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
        if (result.rc != CMPI_RC_OK) throw TreeFailure(failureText(result));
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
        TreeNode node{association};
        for (const InstanceValue& farEnd : answered(request)) {
            node.branches.push_back((this->*branch)(farEnd));
        }
        return node;
    }

    TreeNode installed(const InstanceValue& system) const {
        TreeNode node{labelled(system, text(system, "Name") + " " + text(system, "Version")) +
                      ": installed " + moment(system, "InstallDate")};
        node.branches.push_back(
            associated(system, elementCapabilities, &TreeBuilder::capabilities));
        return node;
    }

    /// The state of what runs; what it can do hangs on the installed one, which is the same system.
    TreeNode running(const InstanceValue& system) const {
        return {labelled(system, text(system, "Name") + " " + text(system, "Version")) + ": " +
                named(system, "EnabledState") + ", health " + named(system, "HealthState") +
                ", up since " + moment(system, "LastBootUpTime")};
    }

    TreeNode capabilities(const InstanceValue& instance) const {
        const Value* editable = instance.property("ElementNameEditSupported");
        const char* name = editable == nullptr || editable->isNull() ? "not known"
                           : editable->boolean()                     ? "editable"
                                                                     : "fixed";
        return {labelled(instance, text(instance, "InstanceID")) + ": name " + name +
                ", shutdown of the host: " + named(instance, "HostShutdownBehavior")};
    }

    static std::string labelled(const InstanceValue& instance, const std::string& label) {
        return label + " (" + instance.path.className + ")";
    }

    static std::string text(const InstanceValue& instance, const char* property) {
        const Value* value = instance.property(property);
        return value == nullptr || value->isNull() ? "(not known)" : value->toText();
    }

    /// The name of a number by the schema, else the number.
    std::string named(const InstanceValue& instance, const char* property) const {
        const Value* value = instance.property(property);
        if (value == nullptr || value->isNull()) return "(not known)";
        const std::string* name = schema_.valueMap(instance.path.className, property)
                                      .find(static_cast<std::int64_t>(value->unsignedInteger()));
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

void drawBranches(const TreeNode& node, const std::string& margin, std::ostream& stream) {
    for (std::size_t index = 0; index < node.branches.size(); ++index) {
        const bool last = index + 1 == node.branches.size();
        const TreeNode& branch = node.branches[index];
        stream << margin << (last ? "└── " : "├── ") << base::escapeForTerminal(branch.text)
               << '\n';
        drawBranches(branch, margin + (last ? "    " : "│   "), stream);
    }
}

}  // namespace

void drawTree(const TreeNode& root, std::ostream& stream) {
    stream << base::escapeForTerminal(root.text) << '\n';
    drawBranches(root, "", stream);
}

std::vector<TreeNode> hostTree(const Ask& ask, const std::string& nameSpace, const Schema& schema) {
    return TreeBuilder(ask, nameSpace, schema).roots();
}

}  // namespace cmpihost
