#ifndef OSSTATUS_LINUX_FILTERED_WALK_H
#define OSSTATUS_LINUX_FILTERED_WALK_H

namespace VA::OSStatusProvider {

/// Moves `cursor` to the next node for which `passes()` is true; without filters that is the next
/// node. Ends past the last node when none passes.
template <class Cursor, class Passes>
void advanceToNext(Cursor& cursor, bool filterSet, Passes passes) {
    do {
        ++cursor;
    } while (filterSet && cursor && !passes());
}

}  // namespace VA::OSStatusProvider

#endif
