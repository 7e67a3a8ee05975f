/*
 * CMPI 2.0: check of the platform symbol.
 *
 * The including project defines exactly one CMPI_PLATFORM_* symbol. This set of headers
 * serves GNU compilers on Linux and nothing else, so that is the only one it accepts.
 */
#ifndef _CMPIPL_H_
#define _CMPIPL_H_

#if !defined(CMPI_PLATFORM_LINUX_GENERIC_GNU)
#error "Define CMPI_PLATFORM_LINUX_GENERIC_GNU: these CMPI headers serve Linux with a GNU compiler."
#endif

#endif /* _CMPIPL_H_ */
