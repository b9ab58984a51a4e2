// Function tables of CMPI: objects, broker, MIs. Brings in the types and the macros too.
//
// A table starts with the CMPI level of the side that filled it (ftVersion, CMPICurrentVersion
// here). Object managers in the field leave slots NULL and state low levels: test the pointer, not
// the level.
#ifndef KORVA_CMPI_CMPIFT_H
#define KORVA_CMPI_CMPIFT_H

#include "cmpidt.h"
#include "cmpios.h"

#include "broker_tables.h"
#include "mi_tables.h"
#include "object_tables.h"

#include "cmpimacs.h"

#endif
