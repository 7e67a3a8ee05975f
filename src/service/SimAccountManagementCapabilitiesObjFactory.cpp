#include "SimAccountManagementCapabilitiesObjFactory.h"

#include <ClassNames.h>

#include <iterator>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

const std::string loggerSimAccountManagementCapabilitiesObjFactory(
    "Corvane.SimAccountManagementCapabilitiesObjFactory");
const UnitTrace unit(loggerSimAccountManagementCapabilitiesObjFactory,
                     "SimAccountManagementCapabilitiesObjFactory");

constexpr const char* SimAccountManagementCapabilitiesProvider =
    "SimAccountManagementCapabilitiesProvider";

using Capabilities = SimAccountManagementCapabilities;
using Factory = SimAccountManagementCapabilitiesFactory;
using namespace property;

constexpr KeyRow<Capabilities> keys[] = {
    {"InstanceID", key::text<&Capabilities::getInstanceID>},
};

// The texts for an array that the broker cannot make. The two differ in one letter.
struct ArrayTexts {
    const char* status;
    const char* trace;
};

constexpr ArrayTexts statesFailed = {
    "Creating array for Property                         RequestedStatesSupported failed.",
    "Creating Array for Property                         RequestedStatesSupported failed."};
constexpr ArrayTexts operationsFailed = {
    "Creating array for Property                         OperationsSupported failed.",
    "Creating Array for Property                         OperationsSupported failed."};

template <auto getter, const ArrayTexts& failed>
void numbers(const InstanceWriter& writer, const char* name, Capabilities& capabilities, Factory&) {
    if (!writer.uint16Array(name, (capabilities.*getter)(), writer.status())) {
        setStatus(writer.status(), writer.broker(), CMPI_RC_ERR_FAILED, failed.status);
        traceToBroker(writer.broker(), 2, SimAccountManagementCapabilitiesProvider, failed.trace);
    }
}

constexpr PropertyRow<Capabilities, Factory> table[] = {
    {"RequestedStatesSupported", numbers<&Capabilities::getRequestedStatesSupported, statesFailed>},
    {"ElementNameEditSupported", boolean<&Capabilities::getElementNameEditSupported>},
    {"ElementName", chars<&Capabilities::getElementName>},
    {"OperationsSupported", numbers<&Capabilities::getOperationsSupported, operationsFailed>},
};

} // namespace

const Factory::Shape& SimAccountManagementCapabilitiesFactory::shape() {
    static const Shape shape = {
        unit,
        accountManagementCapabilitiesClass,
        SimAccountManagementCapabilitiesProvider,
        getSimAccountManagementCapabilitiesInstances,
        &Capabilities::getInstanceID,
        SameKey::Replaces,
        keys,
        table,
        std::size(table),
        2,
        "Create CMPIObjectPath failed",
        "Create CMPIObjectPath failed for                     SimAccountManagementCapabilities "
        "class",
        " accountManagementCapabilitiesCap=",
        " IsObjPath=",
        false,
        false,
        0,
        {false, false, true}};
    return shape;
}

SimAccountManagementCapabilitiesFactory::SimAccountManagementCapabilitiesFactory() = default;

SimAccountManagementCapabilitiesFactory::SimAccountManagementCapabilitiesFactory(bool, bool) {
    unit.entering();
    load();
    unit.exiting();
}

SimAccountManagementCapabilitiesFactory::~SimAccountManagementCapabilitiesFactory() {
    unit.methodQuietly();
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
