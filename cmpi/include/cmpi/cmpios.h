/*
 * CMPI 2.0: types and linkage that depend on the operating system.
 *
 * Threads, mutexes and conditions are opaque handles made and taken by the table
 * CMPIBrokerExtFT; a provider never looks inside them.
 */
#ifndef _CMPIOS_H_
#define _CMPIOS_H_

#include "cmpipl.h"

#include <stdlib.h>

#define CMPI_THREAD_TYPE void*
#define CMPI_MUTEX_TYPE void*
#define CMPI_COND_TYPE void*

/* What a thread function returns, and its calling convention (none on Linux). */
#define CMPI_THREAD_RETURN void*
#define CMPI_THREAD_CDECL

/* Exactly four bytes: createThreadKey stores one through a pointer. */
#define CMPI_THREAD_KEY_TYPE unsigned int

#define CMPI_EXPORT __attribute__((visibility("default")))
#define CMPI_IMPORT __attribute__((visibility("default")))

/* Precedes the definition of a factory: exported under its plain C name. */
#ifdef __cplusplus
#define CMPI_EXTERN_C extern "C" CMPI_EXPORT
#else
#define CMPI_EXTERN_C CMPI_EXPORT
#endif

#endif /* _CMPIOS_H_ */
