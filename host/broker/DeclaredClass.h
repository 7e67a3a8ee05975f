// A class of the schema in the form that the broker needs for every property that a provider
// sets: names by their hash, types as CMPI has them.
#pragma once

#include <cim/Class.h>

#include <cmpi/cmpidt.h>

#include <cstdint>
#include <string_view>
#include <vector>

namespace qelo::broker {

struct DeclaredProperty {
    std::string_view name; // empty: an unused place of the table
    std::uint32_t hash = 0;
    CMPIType type = CMPI_null;
    bool key = false;
    bool embedded = false; // an embedded instance, declared as a string

    // Whether a value of that type may be set.
    bool accepts(CMPIType given) const {
        return given == type || (embedded && (given & ~CMPI_ARRAY) == CMPI_instance &&
                                 (given & CMPI_ARRAY) == (type & CMPI_ARRAY));
    }
};

// Immutable. The class must outlive it.
class DeclaredClass {
public:
    explicit DeclaredClass(const cim::Class& declared);

    // The property of that name (`hash` is its nameHash()), or null.
    const DeclaredProperty* find(std::string_view name, std::uint32_t hash) const;

private:
    void insert(const DeclaredProperty& property);

    std::vector<DeclaredProperty> table_; // open addressing; the size is a power of two
};

} // namespace qelo::broker
