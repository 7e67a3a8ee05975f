// Equality of two key values of object paths, whatever types the object manager gave them.
#pragma once

#include <cmpidt.h>
#include <cmpift.h>

#include <optional>

namespace qelo::platform {

// Whether the two values are equal; nothing where either is a reference, which only the
// comparison of whole paths can answer. Integers of all widths compare by value, texts and
// dates by their characters. A null value equals a null value only; values of different
// kinds (a text and a number, say) never are equal.
std::optional<bool> equalPlainValues(const CMPIData& left, const CMPIData& right);

} // namespace qelo::platform
