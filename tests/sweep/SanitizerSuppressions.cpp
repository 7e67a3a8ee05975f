// Read by ThreadSanitizer when the program starts, whatever its environment says.
#include "SanitizerSuppressions.h"

extern "C" const char* __tsan_default_suppressions(); // NOLINT: the sanitizer's name for it

__attribute__((visibility("default"))) const char* __tsan_default_suppressions() {
    return kThreadSanitizerSuppressions;
}
