// Between CMPI objects and the host's own values. Everything is copied.
//
// Both directions refuse a nesting deeper than maximumDepth (Refusal, FAILED).
#pragma once

#include "Objects.h"
#include "OperationContext.h"

#include <cim/Instance.h>
#include <client/Connection.h>

namespace qelo::broker {

cim::Value toCim(const CMPIData& data, int depth = 0);
cim::ObjectPath toCim(const ObjectPathObject& path, int depth = 0);

// With the listed properties only, when there is a list.
cim::Instance toCim(const InstanceObject& instance, const client::PropertyList& properties = {},
                    int depth = 0);

// The same into an instance that was filled before: what both have is not made anew.
void assign(cim::Instance& to, const InstanceObject& instance,
            const client::PropertyList& properties, int depth = 0);
client::Arguments toCim(const ArgsObject& args);
OperationContext toCim(const ContextObject& context);

// A list that ends with null; null is "all".
client::PropertyList propertyList(const char** names);

// The data's parts lie in `arena`.
CMPIData fromCim(Arena& arena, const cim::Value& value, int depth = 0);
ObjectPathObject* fromCim(Arena& arena, const cim::ObjectPath& path, Ownership owner,
                          int depth = 0);

// `broker` may be null; it is asked for the keys of the class.
InstanceObject* fromCim(Arena& arena, const cim::Instance& instance, Ownership owner,
                        const Broker* broker, int depth = 0);
ArgsObject* fromCim(Arena& arena, const client::Arguments& arguments, Ownership owner);
ContextObject* fromCim(Arena& arena, const OperationContext& context, Ownership owner);

CMPIType cmpiType(cim::Type type, bool array);

} // namespace qelo::broker
