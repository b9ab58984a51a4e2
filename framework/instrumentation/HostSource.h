#ifndef FRAMEWORK_INSTRUMENTATION_HOST_SOURCE_H
#define FRAMEWORK_INSTRUMENTATION_HOST_SOURCE_H

#include <memory>
#include <string>

#include "NodeLexicon.h"

/// Where VA::Instrumentation gets its nodes from.
namespace VA {

/// A walk over the nodes of one type: one stands behind each VA::Instrumentation, and its
/// operations are those of that class, one for one: valid() and next() are its `operator bool` and
/// `operator++`, the others bear its names or shorter ones. One thread uses it at a time; it must
/// not outlive its source. Where the walk stands on no node, reads give false and the status is 0.
class __attribute__((visibility("default"))) NodeCursor {
  public:
    NodeCursor();
    virtual ~NodeCursor();
    NodeCursor(const NodeCursor&) = delete;
    NodeCursor& operator=(const NodeCursor&) = delete;

    /// Stands on the first node of `type`; true if there is one. Called once, before anything else.
    virtual bool select(NodeLexicon::NodeType type) = 0;

    /// True while the walk stands on a node.
    virtual bool valid() = 0;

    /// Moves to the next node. Moving past the last one is final.
    virtual void next() = 0;

    /// Reads a property of the current node. False, with `value` untouched, when the node has no
    /// such value of that type.
    virtual bool readProperty(NodeLexicon::Properties id, std::string& value) = 0;
    virtual bool readProperty(NodeLexicon::Properties id, unsigned int& value) = 0;
    virtual bool readProperty(NodeLexicon::Properties id, bool& value) = 0;

    /// Tells in `value` whether the property is read-only on the current node; false, with `value`
    /// untouched, when that is not known.
    virtual bool isPropertyReadOnly(NodeLexicon::Properties id, bool& value) = 0;

    /// The status code of the current node, in the codes of Instrumentation::getNodeStatus.
    virtual unsigned int nodeStatus() = 0;

    /// Writes the name of the computer that the nodes belong to; false, with `name` untouched, when
    /// it is not known. Answered wherever the walk stands.
    virtual bool readComputerName(std::string& name) = 0;
};

/// A host with managed nodes. Any number of threads may open walks at the same time.
class __attribute__((visibility("default"))) HostSource {
  public:
    HostSource();
    virtual ~HostSource();
    HostSource(const HostSource&) = delete;
    HostSource& operator=(const HostSource&) = delete;

    /// A new walk, which stands on no node yet. Never null.
    virtual std::unique_ptr<NodeCursor> openCursor() = 0;
};

/// Makes `source` the one that every Instrumentation constructed from now on reads; null restores
/// the default, makeLinuxHost(). Objects that exist keep the source they have, and keep it alive.
/// Any thread may call.
__attribute__((visibility("default"))) void setHostSource(std::shared_ptr<HostSource> source);

/// The Linux host that this code runs on (LinuxHost.cpp), never null. `root` is the directory under
/// which all files are looked for; what the kernel gives without a file (its names, its clocks, the
/// limits of the process) is that of the running kernel.
__attribute__((visibility("default"))) std::shared_ptr<HostSource> makeLinuxHost(
    std::string root = "/");

/// The source that an Instrumentation constructed now would read; never null. Any thread may call.
__attribute__((visibility("default"))) std::shared_ptr<HostSource> currentHostSource();

}  // namespace VA

#endif
