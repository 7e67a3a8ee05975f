// What a class takes over from its superclass.
#pragma once

#include <cim/Class.h>

namespace qelo::schema {

// Completes a class as it was declared, given its resolved superclass (null: it has none).
// Throws SchemaError when the two contradict each other or the class itself is not sound:
// a name twice, a new key below a class that has keys, an override of nothing, of another
// type or of a qualifier that may not change, a reference outside of an association.
cim::Class resolved(cim::Class declared, const cim::Class* superclass);

// Roughly how many bytes a class takes.
std::size_t weightOf(const cim::Class& known);

} // namespace qelo::schema
