// Compiles exactly when a set of CMPI headers can stand in for the bundled one: the tables
// are those of CMPI 2.0 without later slots, and what our sources call and define has the
// types that they rely on.

#include <cmpi/cmpift.h>
#include <cmpidt.h>
#include <cmpimacs.h>

#include <cstddef>
#include <type_traits>

#ifndef CMPI_VER_200
#error "not CMPI 2.0"
#endif

static_assert(sizeof(CMPIBrokerFT) == 160);
static_assert(sizeof(CMPIBrokerEncFT) == 168);
static_assert(sizeof(CMPIBrokerExtFT) == 168);
static_assert(sizeof(CMPIBrokerMemFT) == 120);
static_assert(sizeof(CMPIContextFT) == 56);
static_assert(sizeof(CMPIResultFT) == 64);
static_assert(sizeof(CMPIStringFT) == 32);
static_assert(sizeof(CMPIArrayFT) == 56);
static_assert(sizeof(CMPIEnumerationFT) == 48);
static_assert(sizeof(CMPIInstanceFT) == 88);
static_assert(sizeof(CMPIObjectPathFT) == 160);
static_assert(sizeof(CMPIArgsFT) == 56);
static_assert(sizeof(CMPIDateTimeFT) == 48);
static_assert(sizeof(CMPISelectExpFT) == 64);
static_assert(sizeof(CMPIErrorFT) == 216);
static_assert(sizeof(CMPIInstanceMIFT) == 80);
static_assert(sizeof(CMPIAssociationMIFT) == 56);
static_assert(sizeof(CMPIMethodMIFT) == 32);
static_assert(sizeof(CMPIPropertyMIFT) == 48);
static_assert(sizeof(CMPIIndicationMIFT) == 72);
static_assert(sizeof(CMPIValue) == 16 && sizeof(CMPIData) == 24 && sizeof(CMPIStatus) == 16);
static_assert(offsetof(CMPIBrokerEncFT, trace) == 128);
static_assert(offsetof(CMPIBrokerFT, enumerateInstances) == 96);
static_assert(CMPIVersion200 == 200 && CMPI_RC_NO_MORE_ELEMENTS == 18);

// Tables are constant data, here and in the provider.
static_assert(std::is_same_v<decltype(CMPIString::hdl), const void*>);
static_assert(std::is_same_v<decltype(CMPIString::ft), const CMPIStringFT*>);
static_assert(std::is_same_v<decltype(CMPIBroker::bft), const CMPIBrokerFT*>);
static_assert(std::is_same_v<decltype(CMPIInstanceMI::ft), const CMPIInstanceMIFT*>);
static_assert(std::is_same_v<decltype(CMPIMethodMI::ft), const CMPIMethodMIFT*>);
static_assert(std::is_same_v<decltype(CMPIAssociationMI::ft), const CMPIAssociationMIFT*>);

// Slots that differ between generations of headers.
using Broker = const CMPIBroker*;
static_assert(std::is_same_v<decltype(CMPIBrokerFT::brokerVersion), int>);
static_assert(std::is_same_v<decltype(CMPIBrokerMemFT::ftVersion), int>);
static_assert(std::is_same_v<decltype(CMPIErrorFT::ftVersion), int>);
static_assert(std::is_same_v<decltype(CMPIStringFT::getCharPtr),
                             const char* (*)(const CMPIString*, CMPIStatus*)>);
static_assert(
    std::is_same_v<decltype(CMPIBrokerEncFT::trace),
                   CMPIStatus (*)(Broker, CMPILevel, const char*, const char*, const CMPIString*)>);
static_assert(std::is_same_v<decltype(CMPIBrokerEncFT::logMessage),
                             CMPIStatus (*)(Broker, CMPISeverity, const char*, const char*,
                                            const CMPIString*)>);
static_assert(std::is_same_v<decltype(CMPIBrokerExtFT::createThreadKey),
                             int (*)(unsigned int*, void (*)(void*))>);
static_assert(std::is_same_v<decltype(CMPIInstanceFT::setPropertyFilter),
                             CMPIStatus (*)(const CMPIInstance*, const char**, const char**)>);
static_assert(
    std::is_same_v<decltype(CMPIObjectPathFT::addKey),
                   CMPIStatus (*)(const CMPIObjectPath*, const char*, const CMPIValue*, CMPIType)>);
static_assert(
    std::is_same_v<decltype(CMPIArrayFT::setElementAt),
                   CMPIStatus (*)(const CMPIArray*, CMPICount, const CMPIValue*, CMPIType)>);
static_assert(std::is_same_v<decltype(CMPIErrorFT::setMessageArguments),
                             CMPIStatus (*)(const CMPIError*, const CMPIArray*)>);
static_assert(
    std::is_same_v<decltype(CMPIIndicationMIFT::mustPoll),
                   CMPIStatus (*)(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp*,
                                  const char*, const CMPIObjectPath*)>);

// The calls of a provider, each with uncast values.
CMPIStatus calls(const CMPIBroker* broker, const CMPIContext* context, const CMPIResult* result,
                 const CMPIObjectPath* ref, const CMPIArgs* in, const char** properties) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIObjectPath* path =
        CMNewObjectPath(broker, CMGetCharPtr(CMGetNameSpace(ref, &status)), "C", &status);
    if (CMIsNullObject(path))
        CMReturnWithChars(broker, CMPI_RC_ERR_FAILED, "no path");
    CMPIUint32 number = 1;
    CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
    CMSetNameSpace(path, "ns");
    CMSetHostname(path, "host");
    CMAddKey(path, "Name", "text", CMPI_chars);
    CMSetPropertyFilter(instance, properties, nullptr);
    CMSetProperty(instance, "A", "text", CMPI_chars);
    CMSetProperty(instance, "B", &number, CMPI_uint32);
    CMPIArray* array = CMNewArray(broker, 1, CMPI_string, nullptr);
    CMPIString* text = CMNewString(broker, "text", nullptr);
    CMSetArrayElementAt(array, 0, &text, CMPI_string);
    CMSetProperty(instance, "C", &array, CMPI_stringA);
    CMPIDateTime* time = CMNewDateTimeFromChars(broker, "x", nullptr);
    CMGetCharPtr(CMGetStringFormat(time, nullptr));
    CMPIData data = CMGetKey(ref, "Name", nullptr);
    CMPIString* name = nullptr;
    for (CMPICount i = 0; i < CMGetArgCount(in, nullptr); ++i)
        data = CMGetArgAt(in, i, &name, nullptr);
    CMPIEnumeration* names = CBEnumInstanceNames(broker, context, ref, nullptr);
    while (CMHasNext(names, nullptr))
        data = CMGetNext(names, nullptr);
    CBEnumInstances(broker, context, ref, nullptr, &status);
    CMTraceMessage(broker, CMPI_LEV_INFO, "component", "text", nullptr);
    CMLogMessage(broker, CMPI_SEV_ERROR, "id", CMGetCharsPtr(text, nullptr), nullptr);
    CMSetStatusWithChars(broker, &status, CMPI_RC_ERR_FAILED, "text");
    if (CMIsNullValue(data) || CMGetKeyCount(CMGetObjectPath(instance, nullptr), nullptr) == 0)
        CMReturnWithString(CMPI_RC_ERR_FAILED, text);
    CMReturnObjectPath(result, path);
    CMReturnInstance(result, instance);
    CMReturnData(result, &number, CMPI_uint32);
    CMReturnDone(result);
    CMReturn(CMPI_RC_OK);
}

int main() { return 0; }
