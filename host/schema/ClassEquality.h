// Whether two declarations say the same.
#pragma once

#include <cim/Class.h>

namespace qelo::schema {

bool sameDeclaration(const cim::Class& left, const cim::Class& right);
bool sameDeclaration(const cim::QualifierType& left, const cim::QualifierType& right);

} // namespace qelo::schema
