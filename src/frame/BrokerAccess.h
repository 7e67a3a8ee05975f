// Small helpers over the CMPI interface for a broker that may fail at any call: what it
// returns is tested before use, and nothing null is handed back to it.
#pragma once

#include <cmpidt.h>
#include <cmpift.h>
#include <cmpimacs.h>

#include <string>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// Whether there is no object: a null pointer, or an object without a handle.
template <class Encapsulated> bool isNull(const Encapsulated* object) {
    return object == nullptr || object->hdl == nullptr;
}

// The text of a CMPI string, owned by it; empty for no string.
const char* textOf(const CMPIString* string);

// The namespace and the class name of a path, owned by the path; empty where it has none.
// `status`, if given, receives the status of the look-up.
const char* nameSpaceOf(const CMPIObjectPath* path, CMPIStatus* status);
const char* classNameOf(const CMPIObjectPath* path, CMPIStatus* status);

// Whether a key's value is a usable text.
bool holdsText(const CMPIData& key);

// A status with that code and text. The text is left out when there is no broker or it
// cannot make one.
CMPIStatus makeStatus(const CMPIBroker* broker, CMPIrc code, const char* text);

// Gives `status`, unless it is null, that code and text.
void setStatus(CMPIStatus* status, const CMPIBroker* broker, CMPIrc code, const char* text);

// Sends a line to the broker's own trace, if there is a broker.
void traceToBroker(const CMPIBroker* broker, unsigned int level, const char* component,
                   const char* text);

// A new path of `className` in the namespace of `ref`, and nothing else. Null when the broker
// makes none. Both status arguments may be null: `lookup` receives the status of reading the
// namespace, `creation` that of making the path.
CMPIObjectPath* newBarePath(const CMPIBroker* broker, const CMPIObjectPath* ref,
                            const char* className, CMPIStatus* lookup, CMPIStatus* creation);

// The same, placed like `ref` and on this system.
CMPIObjectPath* newPath(const CMPIBroker* broker, const CMPIObjectPath* ref, const char* className,
                        CMPIStatus* lookup, CMPIStatus* creation);

// Gives `path` the namespace of `ref`; place() gives it this system as its host, too.
void setNameSpaceFrom(CMPIObjectPath* path, const CMPIObjectPath* ref, CMPIStatus* status);
void place(CMPIObjectPath* path, const CMPIObjectPath* ref, CMPIStatus* status);

// Adds a key of type CMPI_chars to a path.
void addKey(CMPIObjectPath* path, const char* name, const std::string& text);

// The argument that CMPI's setters take for a value of type CMPI_chars: the text itself.
inline const CMPIValue* charsValue(const char* text) {
    return reinterpret_cast<const CMPIValue*>(text);
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
