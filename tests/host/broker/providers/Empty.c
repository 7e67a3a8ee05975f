/* A library without any factory. */
#include <cmpi/cmpidt.h>

CMPI_EXPORT int nothingToSeeHere(void);
int nothingToSeeHere(void) { return 0; }
