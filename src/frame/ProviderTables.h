// Function tables and factory functions of a provider, from the names of its operations.
//
// `Prefix` is the prefix of the provider's operations (SimAccount), `Provider` the name it
// is registered under (SimAccountProvider). The including unit defines a file-static
// `const CMPIBroker* broker`; each factory function stores its broker there. A factory never
// fails, never touches the status, and returns the same object each time.
#pragma once

#include <cmpidt.h>
#include <cmpift.h>
#include <cmpimacs.h>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

constexpr CMPIStatus succeeded = {CMPI_RC_OK, nullptr};
constexpr CMPIStatus notSupported = {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk

// The instance operations of a read-only class. Cleaning up succeeds, since nothing is held.
#define QELO_READ_ONLY_OPERATIONS(Prefix)                                                          \
    CMPIStatus Prefix##_Cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {                \
        return succeeded;                                                                          \
    }                                                                                              \
    CMPIStatus Prefix##_CreateInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,     \
                                       const CMPIObjectPath*, const CMPIInstance*) {               \
        return notSupported;                                                                       \
    }                                                                                              \
    CMPIStatus Prefix##_ModifyInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,     \
                                       const CMPIObjectPath*, const CMPIInstance*, const char**) { \
        return notSupported;                                                                       \
    }                                                                                              \
    CMPIStatus Prefix##_DeleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,     \
                                       const CMPIObjectPath*) {                                    \
        return notSupported;                                                                       \
    }                                                                                              \
    CMPIStatus Prefix##_ExecQuery(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,          \
                                  const CMPIObjectPath*, const char*, const char*) {               \
        return notSupported;                                                                       \
    }

// Cleaning up a method provider answers "not supported", unlike the other kinds.
#define QELO_METHOD_CLEANUP(Prefix)                                                                \
    CMPIStatus Prefix##_MethodCleanup(CMPIMethodMI*, const CMPIContext*, CMPIBoolean) {            \
        return notSupported;                                                                       \
    }

#define QELO_ASSOCIATION_CLEANUP(Prefix)                                                           \
    CMPIStatus Prefix##_AssociationCleanup(CMPIAssociationMI*, const CMPIContext*, CMPIBoolean) {  \
        return succeeded;                                                                          \
    }

#define QELO_FACTORY(Type, Provider, table)                                                        \
    extern "C" CMPI_EXPORT CMPI##Type##MI* Provider##_Create_##Type##MI(                           \
        const CMPIBroker* brokerOfCaller, const CMPIContext*, CMPIStatus*) {                       \
        static CMPI##Type##MI mi = {nullptr, &(table)};                                            \
        broker = brokerOfCaller;                                                                   \
        return &mi;                                                                                \
    }

#define QELO_INSTANCE_MI(Prefix, Provider)                                                         \
    static CMPIInstanceMIFT instMIFT__ = {CMPIVersion200,                                          \
                                          CMPIVersion200,                                          \
                                          "instance" #Provider,                                    \
                                          Prefix##_Cleanup,                                        \
                                          Prefix##_EnumInstanceNames,                              \
                                          Prefix##_EnumInstances,                                  \
                                          Prefix##_GetInstance,                                    \
                                          Prefix##_CreateInstance,                                 \
                                          Prefix##_ModifyInstance,                                 \
                                          Prefix##_DeleteInstance,                                 \
                                          Prefix##_ExecQuery};                                     \
    QELO_FACTORY(Instance, Provider, instMIFT__)

#define QELO_METHOD_MI(Prefix, Provider)                                                           \
    static CMPIMethodMIFT methMIFT__ = {CMPIVersion200, CMPIVersion200, "method" #Provider,        \
                                        Prefix##_MethodCleanup, Prefix##_InvokeMethod};            \
    QELO_FACTORY(Method, Provider, methMIFT__)

#define QELO_ASSOCIATION_MI(Prefix, Provider)                                                      \
    static CMPIAssociationMIFT assocMIFT__ = {                                                     \
        CMPIVersion200,          CMPIVersion200,                                                   \
        "association" #Provider, Prefix##_AssociationCleanup,                                      \
        Prefix##_Associators,    Prefix##_AssociatorNames,                                         \
        Prefix##_References,     Prefix##_ReferenceNames};                                         \
    QELO_FACTORY(Association, Provider, assocMIFT__)
