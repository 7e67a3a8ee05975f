// Values as JSON, and JSON as text, the same way in everything that is printed.
#pragma once

#include <cim/Value.h>

#include <nlohmann/json.hpp>

#include <string>

namespace qelo::cli {

using OrderedJson = nlohmann::ordered_json;

// Values keep their types; what JSON has no form for (datetimes, references, infinite reals)
// is its text.
OrderedJson valueJson(const cim::Value& value);

// Indented, without a new line at the end. Readable UTF-8 where a terminal may show it, pure
// ASCII otherwise.
std::string dumped(const OrderedJson& json);

} // namespace qelo::cli
