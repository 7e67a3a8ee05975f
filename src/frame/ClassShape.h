// How a class describes itself to the factory that all classes share (ObjFactory.h): its
// names, keys, properties and texts, and where its ways differ from the others'.
#pragma once

#include "InstanceWriter.h"
#include "Keys.h"

#include <UnitTrace.h>

#include <string>
#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// What happens to a record whose key another record of the same load has already.
enum class SameKey {
    Replaces, // the last record stays
    IsDropped // the first record stays; records are counted in 16 bits
};

// On which early returns a factory member traces its exit.
struct ExitTraces {
    bool noInstance;
    bool pathFailed;
    bool unknownKey;
};

template <class Record, class Factory> struct ClassShape {
    const UnitTrace& unit;
    const char* className;
    const char* component; // the provider, as the broker's trace knows it

    bool (*load)(std::vector<Record>& records); // true when it failed
    std::string (Record::*key)();               // by which records are mapped and looked up
    SameKey sameKey;

    KeyTable<Record> keys;
    const PropertyRow<Record, Factory>* rows; // the other properties, in the order of setting
    std::size_t rowCount;

    unsigned int emptyLevel;     // of the broker's trace when there is no instance
    const char* pathFailed;      // status text when the broker makes no path
    const char* pathFailedTrace; // the same for the broker's trace

    const char* recordPiece;    // of the parameter list, for example " simGroup="
    const char* isObjPathPiece; // the same for that flag
    bool isObjPathCounts;       // whether the flag turns a null property list into keys only
    bool reportsLookup;         // whether the caller's status sees the namespace look-ups
    int unknownKeyResult;       // of looking up one instance
    ExitTraces exits;
};

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
