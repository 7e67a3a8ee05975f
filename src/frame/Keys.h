// The keys of a class as a table, and how a path and an instance get them. The text of a key
// is taken when its turn to be set comes, since taking it leaves lines in the trace.
#pragma once

#include "BrokerAccess.h"

#include <platform/TeskCommon.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <string>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// One key: its name, and its text for a record.
template <class Record> struct KeyRow {
    const char* name;
    std::string (*text)(Record& record);
};

// The ordinary texts of keys.
namespace key {

template <const char* const& constant, class Record> std::string fixed(Record&) { return constant; }

template <class Record> std::string systemName(Record&) { return getSystemName(); }

template <auto getter, class Record> std::string text(Record& record) { return (record.*getter)(); }

} // namespace key

// The keys of a class in the order in which they are set. Keeps a reference to the array.
template <class Record> class KeyTable {
public:
    template <std::size_t count>
    constexpr KeyTable(const KeyRow<Record> (&rows)[count]) : rows_(rows), count_(count) {
        static_assert(count <= most, "more keys than any class has");
    }

    const KeyRow<Record>* begin() const { return rows_; }
    const KeyRow<Record>* end() const { return rows_ + count_; }

    // Adds the keys of a record to a path.
    void addTo(CMPIObjectPath* path, Record& record) const {
        for (const KeyRow<Record>& row : *this) {
            addKey(path, row.name, row.text(record));
        }
    }

    // Hands the requested list and the names of the keys to the broker's own filter, then sets
    // the keys of a record.
    void setIn(CMPIInstance* instance, const char** properties, Record& record) const {
        std::array<const char*, most + 1> names{}; // ends with null
        std::transform(begin(), end(), names.begin(),
                       [](const KeyRow<Record>& row) { return row.name; });
        CMSetPropertyFilter(instance, properties, names.data());
        for (const KeyRow<Record>& row : *this) {
            const std::string text = row.text(record);
            CMSetProperty(instance, row.name, charsValue(text.c_str()), CMPI_chars);
        }
    }

private:
    static constexpr std::size_t most = 8;

    const KeyRow<Record>* rows_;
    std::size_t count_;
};

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
