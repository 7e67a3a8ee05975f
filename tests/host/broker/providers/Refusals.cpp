// Factories that fail in one way each.
#include "Widgets.h"

#include <stdexcept>

using widgets::broker;

CMPI_EXTERN_C CMPIInstanceMI* Refusing_Create_InstanceMI(const CMPIBroker* mb, const CMPIContext*,
                                                         CMPIStatus* st) {
    CMSetStatusWithChars(mb, st, CMPI_RC_ERR_ACCESS_DENIED, "not on this machine");
    return nullptr;
}

CMPI_EXTERN_C CMPIInstanceMI* Silent_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                       CMPIStatus*) {
    return nullptr;
}

CMPI_EXTERN_C CMPIInstanceMI* Throwing_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                         CMPIStatus*) {
    throw std::runtime_error("no paint");
}

CMPI_EXTERN_C CMPIInstanceMI* Tableless_Create_InstanceMI(const CMPIBroker*, const CMPIContext*,
                                                          CMPIStatus*) {
    static CMPIInstanceMI mi = {nullptr, nullptr};
    return &mi;
}

// Asks, while it is being made, for its own instances.
CMPI_EXTERN_C CMPIInstanceMI* Eager_Create_InstanceMI(const CMPIBroker* mb, const CMPIContext* ctx,
                                                      CMPIStatus* st) {
    const CMPIObjectPath* own = CMNewObjectPath(mb, "root/test", "TEST_Eager", nullptr);
    CBEnumInstanceNames(mb, ctx, own, st);
    return nullptr;
}

// Succeeds at every second attempt.
CMPI_EXTERN_C CMPIMethodMI* Slow_Create_MethodMI(const CMPIBroker*, const CMPIContext*,
                                                 CMPIStatus* st) {
    static int attempts = 0;
    static const CMPIMethodMIFT table = {CMPIVersion200, 1, "Slow", nullptr, nullptr};
    static CMPIMethodMI mi = {nullptr, &table};
    if (++attempts % 2 == 0) {
        return &mi;
    }
    st->rc = CMPI_RC_ERR_FAILED;
    return nullptr;
}

CMPI_EXTERN_C CMPIIndicationMI* Widget_Create_IndicationMI(const CMPIBroker* mb, const CMPIContext*,
                                                           CMPIStatus*) {
    static const CMPIIndicationMIFT table = {
        CMPIVersion200,
        1,
        "Widget",
        [](CMPIIndicationMI*, const CMPIContext*, CMPIBoolean) {
            return CMPIStatus{CMPI_RC_OK, nullptr};
        },
        nullptr,
        nullptr,
        nullptr,
        nullptr,
        nullptr,
        nullptr};
    static CMPIIndicationMI mi = {nullptr, &table};
    broker = mb;
    return &mi;
}
