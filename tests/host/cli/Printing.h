// How CIM terms appear in the failures of tests.
#pragma once

#include <cim/ObjectPath.h>

#include <ostream>

namespace qelo::cim {

inline void PrintTo(const Value& value, std::ostream* stream) {
    *stream << typeName(value.type()) << (value.isArray() ? "[] " : " ")
            << (value.isNull() ? "NULL" : value.toText());
}

inline void PrintTo(Type type, std::ostream* stream) { *stream << typeName(type); }

inline void PrintTo(const ObjectPath& path, std::ostream* stream) { *stream << path.toText(); }

} // namespace qelo::cim
