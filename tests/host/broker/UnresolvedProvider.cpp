// A library with a symbol that no library has.
#include <cmpi/cmpift.h>

extern "C" int symbolThatNobodyDefines();

CMPI_EXTERN_C int callsIt() {
    return symbolThatNobodyDefines();
}
