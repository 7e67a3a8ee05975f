// What the object manager inside this process knows of the schema: the keys of the classes
// that are served here, and from which standard classes they derive.
#pragma once

#include <broker/Hooks.h>

namespace qelo::cli {

broker::SchemaHooks knownSchema();

} // namespace qelo::cli
