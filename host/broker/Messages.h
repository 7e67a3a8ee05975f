// The message slots of the broker: default texts, translations, and the arguments that take
// the place of $0 to $9.
#pragma once

#include <cmpi/cmpift.h>

namespace qelo::broker {

// CMPI has these two with a variable number of arguments.
// NOLINTBEGIN(cert-dcl50-cpp)
CMPIString* getMessage(const CMPIBroker* mb, const char* messageId, const char* defaultText,
                       CMPIStatus* st, CMPICount count, ...);
CMPIString* getMessage2(const CMPIBroker* mb, const char* messageId, CMPIMsgFileHandle file,
                        const char* defaultText, CMPIStatus* st, CMPICount count, ...);
// NOLINTEND(cert-dcl50-cpp)
CMPIStatus openMessageFile(const CMPIBroker* mb, const char* file, CMPIMsgFileHandle* handle);
CMPIStatus closeMessageFile(const CMPIBroker* mb, CMPIMsgFileHandle handle);

} // namespace qelo::broker
