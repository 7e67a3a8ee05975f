// What instances do with their properties, keys and filter. Used by the provider's slots and
// by the host when it makes instances.
//
// A property that is a key also becomes a key of the instance's path, whether the filter
// keeps the property or not. Keys are: those the schema names for the class, those the
// provider names with its filter, and those the path has. The declaration of a class, where
// the schema has one, is all that counts: it tells the keys, and properties that it does not
// have, or has with another type, are refused. Where neither schema nor provider
// says anything, a reference is taken for a key, as it is in nearly every association.
#pragma once

#include "Objects.h"

namespace qelo::broker {

// An instance without properties at a copy of that path. `broker` may be null: no schema.
InstanceObject* newInstance(Arena& arena, const ObjectPathObject& path, Ownership owner,
                            const Broker* broker);

// Adds or replaces; `data` lies in the instance's arena already. A property that the filter
// leaves out is not kept. Refusal: NO_SUCH_PROPERTY, TYPE_MISMATCH for what the class does not
// declare so.
void setProperty(InstanceObject& instance, std::string_view name, CMPIData data,
                 StringObject* origin);

// `properties` null: no filter. Both lists end with null.
void setPropertyFilter(InstanceObject& instance, const char** properties, const char** keys);

void setObjectPath(InstanceObject& instance, const ObjectPathObject& path);

} // namespace qelo::broker
