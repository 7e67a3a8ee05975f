/* What a compiler makes of the CMPI headers, as data that the test can walk through. It is
   collected twice from the same lists: by a C11 and by a C++17 translation unit. */
#pragma once

#include <stddef.h>

#ifdef __cplusplus
extern "C" {
#endif

/* One thing that was looked at. */
typedef struct AbiFact {
    const char* what;
    unsigned long long expected;
    unsigned long long actual;
} AbiFact;

typedef struct AbiFacts {
    const AbiFact* facts;
    size_t count;
} AbiFacts;

/* Sizes, alignments, offsets and constants, and for each type 1 where it is the expected
   one. */
AbiFacts abiFactsOfC(void);

#ifdef __cplusplus
}
#endif
