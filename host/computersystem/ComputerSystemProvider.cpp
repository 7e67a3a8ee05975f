// The provider of ZANTH_ComputerSystem: one instance, this machine. An ordinary CMPI instance
// provider for object managers that have no other provider of the class.

#include "SystemFacts.h"

#include <frame/Barrier.h>
#include <frame/InstanceWriter.h>
#include <frame/Keys.h>
#include <frame/ProviderTables.h>

#include <ClassNames.h>

#include <cstring>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerComputerSystem("Qelo.ComputerSystemProvider");
const UnitTrace unit(loggerComputerSystem, "ComputerSystemProvider");

const CMPIBroker* broker = nullptr;

using qelo::computersystem::readSystemFacts;
using qelo::computersystem::SystemFacts;

constexpr std::uint16_t enabled = 2;      // CIM EnabledState
constexpr std::uint16_t statusOk = 2;     // CIM OperationalStatus
constexpr std::uint16_t notDedicated = 0; // CIM Dedicated

constexpr KeyRow<const SystemFacts> keyRows[] = {
    {"CreationClassName", key::fixed<ComputerSystemClass>},
    {"Name", [](const SystemFacts& facts) { return facts.name; }},
};
const KeyTable<const SystemFacts> keys(keyRows);

const std::vector<std::string> identifyingDescriptions = {"ZANTH:OperatingSystem", "ZANTH:Kernel"};

constexpr PropertyRow<const SystemFacts, const InstanceWriter> table[] = {
    {"Caption",
     [](auto& writer, auto* name, auto&, auto&) { writer.chars(name, "Computer System"); }},
    {"Description",
     [](auto& writer, auto* name, auto& facts, auto&) {
         writer.chars(name, facts.name + ", running " + facts.operatingSystem);
     }},
    {"ElementName",
     [](auto& writer, auto* name, auto& facts, auto&) { writer.chars(name, facts.name); }},
    {"EnabledState", [](auto& writer, auto* name, auto&, auto&) { writer.uint16(name, enabled); }},
    {"OperationalStatus",
     [](auto& writer, auto* name, auto&, auto&) { writer.uint16Array(name, {statusOk}, nullptr); }},
    {"Dedicated", [](auto& writer, auto* name, auto&,
                     auto&) { writer.uint16Array(name, {notDedicated}, nullptr); }},
    {"OtherIdentifyingInfo",
     [](auto& writer, auto* name, auto& facts, auto&) {
         writer.strings(name, {facts.operatingSystem, facts.kernel});
     }},
    {"IdentifyingDescriptions",
     [](auto& writer, auto* name, auto&, auto&) { writer.strings(name, identifyingDescriptions); }},
};

// Null when the broker makes none.
CMPIInstance* makeInstance(const CMPIObjectPath* ref, const char** properties,
                           const SystemFacts& facts) {
    CMPIInstance* instance = newInstance(broker, ref, ComputerSystemClass, nullptr);
    if (instance != nullptr) {
        keys.setIn(instance, properties, facts);
        const PropertyFilter filter(properties, PropertyFilter::NullList::Everything);
        const InstanceWriter writer(broker, instance, nullptr);
        for (const auto& row : table) {
            if (filter.wants(row.name)) {
                row.set(writer, row.name, facts, writer);
            }
        }
    }
    return instance;
}

// Whether each key that a path names is this system's; one without keys names none.
bool namesThisSystem(const CMPIObjectPath* path, const SystemFacts& facts) {
    for (const auto& row : keys) {
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        const CMPIData data = CMGetKey(path, row.name, &status);
        if (status.rc != CMPI_RC_OK || !holdsText(data) ||
            row.text(facts) != textOf(data.value.string)) {
            return false;
        }
    }
    return true;
}

CMPIStatus finish(const CMPIResult* result) {
    CMReturnDone(result);
    return succeeded;
}

CMPIStatus couldNotMake() {
    return makeStatus(broker, CMPI_RC_ERR_FAILED, "the object manager made no object");
}

CMPIStatus ComputerSystem_EnumInstanceNames(CMPIInstanceMI*, const CMPIContext*,
                                            const CMPIResult* result, const CMPIObjectPath* ref) {
    return guarded(broker, unit, TraceSite::here(), [&] {
        CMPIObjectPath* path = newPath(broker, ref, ComputerSystemClass, nullptr, nullptr);
        if (path == nullptr) {
            return couldNotMake();
        }
        const SystemFacts facts = readSystemFacts();
        keys.addTo(path, facts);
        CMReturnObjectPath(result, path);
        return finish(result);
    });
}

CMPIStatus ComputerSystem_EnumInstances(CMPIInstanceMI*, const CMPIContext*,
                                        const CMPIResult* result, const CMPIObjectPath* ref,
                                        const char** properties) {
    return guarded(broker, unit, TraceSite::here(), [&] {
        CMPIInstance* instance = makeInstance(ref, properties, readSystemFacts());
        if (instance == nullptr) {
            return couldNotMake();
        }
        CMReturnInstance(result, instance);
        return finish(result);
    });
}

CMPIStatus ComputerSystem_GetInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                      const CMPIObjectPath* ref, const char** properties) {
    return guarded(broker, unit, TraceSite::here(), [&] {
        const SystemFacts facts = readSystemFacts();
        if (!namesThisSystem(ref, facts)) {
            return makeStatus(broker, CMPI_RC_ERR_NOT_FOUND, "no such computer system");
        }
        CMPIInstance* instance = makeInstance(ref, properties, facts);
        if (instance == nullptr) {
            return couldNotMake();
        }
        CMReturnInstance(result, instance);
        return finish(result);
    });
}

QELO_READ_ONLY_OPERATIONS(ComputerSystem)

} // namespace

QELO_INSTANCE_MI(ComputerSystem, QeloComputerSystemProvider)

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
