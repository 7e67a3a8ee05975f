// A class of the schema in the form that the broker needs for every property that a provider
// sets: names by their hash, types as CMPI has them.
#pragma once

#include "Arena.h"

#include <cim/Class.h>

#include <cmpi/cmpidt.h>

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace qelo::broker {

struct DeclaredProperty {
    std::string_view name;          // empty: an unused place of the table
    StringObject* object = nullptr; // the name, for instances
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

// Immutable but for what it learns of the order in which providers set properties. Safe to use from
// several threads. The class must outlive it, and it the instances.
class DeclaredClass {
public:
    explicit DeclaredClass(const cim::Class& declared);

    // The property of that name (`hash` is its nameHash()), or null.
    const DeclaredProperty* find(std::string_view name, std::uint32_t hash) const;

    // The one that was set after `last` (null: as the first one) in another instance, or null.
    // Providers set the properties of all their instances in the same order.
    const DeclaredProperty* likelyAfter(const DeclaredProperty* last) const {
        return followers_[placeOf(last)].load(std::memory_order_relaxed);
    }
    void noteFollower(const DeclaredProperty* last, const DeclaredProperty& next) const {
        followers_[placeOf(last)].store(&next, std::memory_order_relaxed);
    }

private:
    void insert(const DeclaredProperty& property);
    std::size_t placeOf(const DeclaredProperty* property) const {
        return property ? static_cast<std::size_t>(property - table_.data()) : table_.size();
    }

    Arena names_;
    std::vector<DeclaredProperty> table_; // open addressing; the size is a power of two
    // Of each place of the table, and of the beginning.
    mutable std::vector<std::atomic<const DeclaredProperty*>> followers_;
};

} // namespace qelo::broker
