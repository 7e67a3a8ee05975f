/* A C11 provider made with the stubs of the convenience layer. */
#pragma once

#include <cmpi/cmpimacs.h>

#ifdef __cplusplus
extern "C" {
#endif

CMPIInstanceMI* CSample_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
CMPIMethodMI* CSample_Create_MethodMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);

/* The broker that the factories stored. */
const CMPIBroker* brokerOfCSample(void);

/* A status with the message "from C", after a message with two arguments was asked for. */
CMPIStatus statusMadeInC(const CMPIBroker* broker);

#ifdef __cplusplus
}
#endif
