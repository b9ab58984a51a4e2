// What the baseline answers: the paths and instances that the provider gives for one simulated
// node, as constants.
#ifndef BENCH_BASELINE_ANSWERS_H
#define BENCH_BASELINE_ANSWERS_H

#include <cmpi/cmpidt.h>

namespace baseline {

struct Path;

/// A key binding: text, or a reference to another path.
struct Key {
    const char* name;
    const char* text;
    const Path* reference;
};

/// One value; `type` says which of the members holds it.
struct Property {
    const char* name;
    CMPIType type;
    const char* text = nullptr;
    unsigned long long number = 0;
    const Path* reference = nullptr;
    const unsigned short* list = nullptr;
    unsigned listLength = 0;
};

struct Path {
    const char* className;
    const Key* keys;
    unsigned keyCount;
};

struct Answer {
    Path path;
    const Property* properties;
    unsigned propertyCount;
};

/// The answer for a class, null if there is none.
const Answer* answerOf(const char* className);

/// The far end of a source of one class through an association, null if there is none.
const Answer* farEndOf(const char* sourceClass, const char* assocClass);

}  // namespace baseline

#endif
