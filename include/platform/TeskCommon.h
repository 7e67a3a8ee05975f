// Common support of the platform (libqeloteskcommon.so.1).
#pragma once

#include "PlatformApi.h"

#include <cmpidt.h>

#include <string>

namespace Tesk {

// The name of this system, as used for host names and the "SystemName" key. Never empty.
QELO_PLATFORM_API std::string getSystemName();

// Whether two object paths name the same object: true when they do.
// Class names are compared ignoring case; every key of `wanted` must be in `path` with an
// equal value (texts exactly, references by this same rule). With `strict` both must also
// have the same number of keys. Host and namespace are not compared. Neither path is
// changed or kept; a null path equals nothing.
QELO_PLATFORM_API bool isObjPathsEqual(const CMPIObjectPath* wanted, const CMPIObjectPath* path,
                                       bool strict);

// `text` in UTF-8. What is not a Unicode character becomes U+FFFD.
QELO_PLATFORM_API std::string make_string(const std::wstring& text);

} // namespace Tesk
