#ifndef TESTS_CMPI_LEVEL100_H
#define TESTS_CMPI_LEVEL100_H

#include <stddef.h>

#ifdef __cplusplus
extern "C" {
#endif

// A size or an offset at CMPI level 100, and what it must be in each word size.
struct Level100Fact {
    const char* name;
    size_t actual;
    size_t in32;
    size_t in64;
};

// All facts; count receives their number. Static storage.
const struct Level100Fact* level100Facts(size_t* count);

// CMPICurrentVersion at level 100.
int level100Version(void);

// miVersion in the table of an MI whose stub was compiled at level 100.
int level100StubVersion(void);

#ifdef __cplusplus
}
#endif

#endif
