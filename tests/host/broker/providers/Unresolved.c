/* A library that needs a function which no library has. */
#include <cmpi/cmpidt.h>

int aFunctionThatNobodyDefines(void);

CMPI_EXPORT int needsMore(void);
int needsMore(void) { return aFunctionThatNobodyDefines(); }
