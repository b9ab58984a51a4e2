// What CMPI takes from the platform: size_t, types of threads and locks, and how symbols are
// exported.
#ifndef KORVA_CMPI_CMPIOS_H
#define KORVA_CMPI_CMPIOS_H

#include <stdlib.h>

// The build names its platform, here and with any other CMPI headers. These headers serve Linux on
// i386 and x86-64 with the GNU conventions.
#ifndef CMPI_PLATFORM_LINUX_GENERIC_GNU
#error "Define CMPI_PLATFORM_LINUX_GENERIC_GNU: the CMPI headers serve no other platform"
#endif

// Handles of CMPIBrokerExtFT; the object manager decides what they point at.
#define CMPI_THREAD_RETURN void*
#define CMPI_THREAD_TYPE void*
#define CMPI_MUTEX_TYPE void*
#define CMPI_COND_TYPE void*
#define CMPI_THREAD_KEY_TYPE unsigned long int

// Calling convention of a thread's start function.
#define CMPI_THREAD_CDECL

// Makes a symbol visible outside its library.
#define CMPI_EXPORT __attribute__((visibility("default")))

// Stands before a factory function: exported, and without C++ name decoration.
#ifdef __cplusplus
#define CMPI_EXTERN_C extern "C" CMPI_EXPORT
#else
#define CMPI_EXTERN_C CMPI_EXPORT
#endif

#endif
