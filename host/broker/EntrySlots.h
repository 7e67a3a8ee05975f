// The getters that paths, instances, argument lists and contexts have in common.
#pragma once

#include "Slot.h"

namespace qelo::broker {

// By name or by position; Refusal with NO_SUCH_PROPERTY when there is no such entry.
inline const Entry& entryNamed(const EntryList& list, const char* name) {
    const Entry* entry = list.find(givenName(name));
    if (!entry) {
        throw Refusal{CMPI_RC_ERR_NO_SUCH_PROPERTY};
    }
    return *entry;
}

// `name`, unless null, takes the entry's name.
inline const Entry& entryAt(const EntryList& list, CMPICount index, CMPIString** name) {
    if (index >= list.size()) {
        throw Refusal{CMPI_RC_ERR_NO_SUCH_PROPERTY};
    }
    if (name) {
        *name = &list[index].name->cmpi;
    }
    return list[index];
}

// A slot that answers a value by position: `name`, unless null, is null when it is refused.
template <class Body> CMPIData positionSlot(CMPIString** name, CMPIStatus* st, Body body) {
    if (name) {
        *name = nullptr;
    }
    return slot(st, absentData(), body);
}

inline CMPICount countOf(const EntryList& list) { return static_cast<CMPICount>(list.size()); }

} // namespace qelo::broker
