#ifndef OSSTATUS_FACADE_ANSWER_H
#define OSSTATUS_FACADE_ANSWER_H

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>

#include <vector>

namespace VA::OSStatusFacade {

/// What the provider returned to one question. The elements belong to the broker, as all that a
/// provider returns.
class Answer {
  public:
    /// Calls `ask` with a CMPIResult that gathers here; `ask` returns the provider's status. Throws
    /// std::bad_alloc when something that was returned found no room, and what `ask` throws.
    template <class Ask>
    explicit Answer(Ask ask) : status_(ask(&result_)) {
        requireRoom();
    }
    Answer(const Answer&) = delete;
    Answer& operator=(const Answer&) = delete;

    CMPIrc rc() const { return status_.rc; }

    /// Nulls are left out.
    const std::vector<const CMPIObjectPath*>& paths() const { return paths_; }
    const std::vector<const CMPIInstance*>& instances() const { return instances_; }
    bool isEmpty() const { return paths_.empty() && instances_.empty(); }

    /// Whether the provider said that it is done. It does not when its walk broke off, and the
    /// status is OK all the same.
    bool isDone() const { return done_; }

  private:
    struct Table;
    static const CMPIResultFT table;

    void requireRoom() const;

    // CMPI has no const here; nobody writes the table.
    CMPIResult result_ = {this, const_cast<CMPIResultFT*>(&table)};
    std::vector<const CMPIObjectPath*> paths_;
    std::vector<const CMPIInstance*> instances_;
    bool done_ = false;
    bool full_ = false;
    CMPIStatus status_;
};

}  // namespace VA::OSStatusFacade

#endif
