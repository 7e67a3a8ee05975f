// The factory of every class: reads the records of one request from the node store and turns
// them into CMPI object paths and instances, which belong to the broker. Constructed, asked
// and dropped within one call.
//
// A class derives its factory from ObjFactory<its record, itself>, gives its members their
// names with QELO_FACTORY_MEMBERS, and defines `shape()`.
#pragma once

#include "ClassShape.h"

#include <cstdint>
#include <map>
#include <string>
#include <utility>
#include <vector>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// The names that a class gives to the shared members.
struct FactoryNames {
    const char* createMap;
    const char* allPaths;
    const char* make;
    const char* one;
    const char* allInstances;
};

enum CollectResult : int { collected = 0, noInstance = 1, creationFailed = 2 };

template <class Record, class Derived> class ObjFactory {
public:
    ObjFactory(const ObjFactory&) = delete;
    ObjFactory& operator=(const ObjFactory&) = delete;

    // The number of records by key, in 16 bits (65,536 count as 0).
    unsigned short getNumberOfInstances() {
        lines().entering();
        const auto noOfInstances = static_cast<unsigned short>(map_.size());
        lines().variable("noOfInstances", noOfInstances);
        lines().exiting();
        return noOfInstances;
    }

    // Appends the path of every record in key order. Returns 0 on success; 1 when there is
    // none, with `status` untouched; 2 when the broker makes no path, with `status` set to
    // CMPI_RC_ERR_FAILED. `status` may be null.
    int allPaths(const CMPIBroker* broker, const CMPIObjectPath* ref,
                 std::vector<CMPIObjectPath*>& objectPaths, CMPIStatus* status) {
        const CallTrace call(lines(),
                             parameters(" broker=", broker, " ref=", ref,
                                        " objectPaths=", &objectPaths, " status=", status),
                             at(Derived::names.allPaths));
        const int result = collectPaths(broker, ref, objectPaths, status);
        if (result == collected || (result == noInstance && shape().exits.noInstance) ||
            (result == creationFailed && shape().exits.pathFailed)) {
            call.leave(at(Derived::names.allPaths));
        }
        return result;
    }

    // One instance: its keys, and those properties that `properties` names (null: all of
    // them, or none where `isObjPath` counts and is set). Null when the broker makes none.
    CMPIInstance* make(const CMPIBroker* broker, const CMPIObjectPath* ref, Record record,
                       const char** properties, bool isObjPath, CMPIStatus* rc) {
        const CallTrace call(lines(),
                             parameters(" broker=", broker, " ref=", ref, shape().recordPiece,
                                        &record, " properties=", properties, shape().isObjPathPiece,
                                        isObjPath, " rc=", rc),
                             at(Derived::names.make));
        const bool keysOnly = isObjPath && shape().isObjPathCounts;
        const PropertyFilter filter(properties, keysOnly ? PropertyFilter::NullList::Nothing
                                                         : PropertyFilter::NullList::Everything);
        CMPIInstance* instance =
            newInstance(broker, ref, shape().className, shape().reportsLookup ? rc : nullptr);
        if (instance != nullptr) {
            shape().keys.setIn(instance, properties, record);
            setProperties(InstanceWriter(broker, instance, rc), filter, record);
        }
        return call.leave(instance, at(Derived::names.make));
    }

    // Appends the instance of the record whose key is `key` exactly, null if it cannot be
    // made. Returns 0; without such a record nothing is appended and the result is the class's.
    int one(const CMPIBroker* broker, const CMPIObjectPath* ref, CMPIString* key,
            const char** properties, std::vector<CMPIInstance*>& instances, CMPIStatus* rc) {
        const CallTrace call(lines(),
                             parameters(" broker=", broker, " ref=", ref, " key=", key,
                                        " properties=", properties, " instances=", &instances,
                                        " rc=", rc),
                             at(Derived::names.one));
        const auto found = map_.find(textOf(key));
        if (found != map_.end()) {
            instances.push_back(make(broker, ref, found->second, properties, false, rc));
            return call.leave(0, at(Derived::names.one));
        }
        if (shape().exits.unknownKey) {
            call.leave(at(Derived::names.one));
        }
        return shape().unknownKeyResult;
    }

    // Appends the instance of every record in key order, null ones included. Returns 0.
    int allInstances(const CMPIBroker* broker, const CMPIObjectPath* ref, const char** properties,
                     bool isObjPath, std::vector<CMPIInstance*>& instances, CMPIStatus* rc) {
        const CallTrace call(lines(),
                             parameters(" broker=", broker, " ref=", ref,
                                        " properties=", properties, " isObjPath=", isObjPath,
                                        " instances=", &instances, " rc=", rc),
                             at(Derived::names.allInstances));
        for (const auto& entry : map_) {
            instances.push_back(make(broker, ref, entry.second, properties, isObjPath, rc));
        }
        return call.leave(0, at(Derived::names.allInstances));
    }

protected:
    using Shape = ClassShape<Record, Derived>;

    ObjFactory() = default;
    ~ObjFactory() = default;

    // Reads the records; where that fails, the factory stays without any by key.
    void load() {
        if (!shape().load(records_)) {
            createMap();
        }
    }

private:
    static const Shape& shape() { return Derived::shape(); }
    static const UnitTrace& lines() { return shape().unit; }
    static TraceSite at(const char* name, int line = __builtin_LINE()) { return {name, line}; }

    // The map takes over what the records hold; nothing reads them there any more. Stores often
    // have their records in the order of the keys, so each is first tried at the end.
    void createMap() {
        lines().entering(at(Derived::names.createMap));
        if (shape().sameKey == SameKey::Replaces) {
            for (Record& record : records_) {
                const auto entry = map_.try_emplace(map_.end(), (record.*shape().key)());
                entry->second = std::move(record);
            }
        } else {
            const auto count = static_cast<std::uint16_t>(records_.size());
            for (std::uint16_t i = 0; i < count; ++i) {
                Record& record = records_.at(i);
                map_.emplace_hint(map_.end(), (record.*shape().key)(), std::move(record));
            }
        }
        lines().exiting(at(Derived::names.createMap));
    }

    int collectPaths(const CMPIBroker* broker, const CMPIObjectPath* ref,
                     std::vector<CMPIObjectPath*>& paths, CMPIStatus* status) {
        if (map_.empty()) {
            traceToBroker(broker, shape().emptyLevel, shape().component, "***No instance found***");
            return noInstance;
        }
        for (const auto& entry : map_) {
            Record record = entry.second;
            CMPIObjectPath* path = newPath(broker, ref, shape().className, status, status);
            if (path == nullptr) {
                setStatus(status, broker, CMPI_RC_ERR_FAILED, shape().pathFailed);
                traceToBroker(broker, 2, shape().component, shape().pathFailedTrace);
                return creationFailed;
            }
            shape().keys.addTo(path, record);
            paths.push_back(path);
        }
        return collected;
    }

    void setProperties(const InstanceWriter& writer, const PropertyFilter& filter, Record& record) {
        for (std::size_t i = 0; i < shape().rowCount; ++i) {
            const PropertyRow<Record, Derived>& row = shape().rows[i];
            if (filter.wants(row.name)) {
                row.set(writer, row.name, record, static_cast<Derived&>(*this));
            }
        }
    }

    std::vector<Record> records_;       // in store order, until they are in the map
    std::map<std::string, Record> map_; // by key
};

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk

// The members of a factory under the names of its class.
#define QELO_FACTORY_MEMBERS(Class)                                                                \
    static constexpr FactoryNames names = {                                                        \
        "_create" #Class "Map", "getAll" #Class "CMPIObjPaths", "make" #Class "Instance",          \
        "getOne" #Class "CMPIInstance", "getAll" #Class "CMPIInstances"};                          \
    int getAll##Class##CMPIObjPaths(const CMPIBroker* broker, const CMPIObjectPath* ref,           \
                                    std::vector<CMPIObjectPath*>& objectPaths,                     \
                                    CMPIStatus* status) {                                          \
        return allPaths(broker, ref, objectPaths, status);                                         \
    }                                                                                              \
    CMPIInstance* make##Class##Instance(const CMPIBroker* broker, const CMPIObjectPath* ref,       \
                                        Class record, const char** properties, bool isObjPath,     \
                                        CMPIStatus* rc) {                                          \
        return make(broker, ref, std::move(record), properties, isObjPath, rc);                    \
    }                                                                                              \
    int getOne##Class##CMPIInstance(const CMPIBroker* broker, const CMPIObjectPath* ref,           \
                                    CMPIString* key, const char** properties,                      \
                                    std::vector<CMPIInstance*>& instances, CMPIStatus* rc) {       \
        return one(broker, ref, key, properties, instances, rc);                                   \
    }                                                                                              \
    int getAll##Class##CMPIInstances(const CMPIBroker* broker, const CMPIObjectPath* ref,          \
                                     const char** properties, bool isObjPath,                      \
                                     std::vector<CMPIInstance*>& instances, CMPIStatus* rc) {      \
        return allInstances(broker, ref, properties, isObjPath, instances, rc);                    \
    }
