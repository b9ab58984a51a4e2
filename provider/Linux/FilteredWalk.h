#ifndef OSSTATUS_LINUX_FILTERED_WALK_H
#define OSSTATUS_LINUX_FILTERED_WALK_H

#include <strings.h>

#include <cstddef>
#include <string>
#include <vector>

namespace VA::OSStatusProvider {

/// Moves `cursor` to the next node for which `passes()` is true; without filters that is the next
/// node. Ends past the last node when none passes.
template <class Cursor, class Passes>
void advanceToNext(Cursor& cursor, bool filterSet, Passes passes) {
    do {
        ++cursor;
    } while (filterSet && cursor && !passes());
}

/// Whether the element's current node passes every filter: it has the text that the filter's type
/// stands for, and that equals the filter's value, letter case aside. `texts` holds the getters of
/// these texts, by type; a filter of any other type passes. The first that fails ends the test.
template <class Element, std::size_t count>
bool passesAll(Element& element, const std::vector<typename Element::Filter>& filters,
               bool (Element::*const (&texts)[count])(std::string&)) {
    std::string text;
    for (const typename Element::Filter& filter : filters) {
        const auto type = static_cast<std::size_t>(filter.type);
        if (type >= count) continue;
        if (!(element.*texts[type])(text)) return false;
        if (strcasecmp(filter.value.c_str(), text.c_str()) != 0) return false;
    }
    return true;
}

}  // namespace VA::OSStatusProvider

#endif
