/*
 * A provider in C, written with the macros as such providers are. "Plain" serves instances;
 * the generic factory makes any other instance interface by name, unless the name is
 * "Unwanted". Methods answer nothing at all.
 */
#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <string.h>

static const CMPIBroker* broker;

static CMPIInstance* makeInstance(const CMPIObjectPath* ref, const char* name,
                                  const char** properties) {
    static const char* keys[] = {"Name", NULL};
    CMPIStatus status = {CMPI_RC_OK, NULL};
    CMPIObjectPath* path =
        CMNewObjectPath(broker, CMGetCharPtr(CMGetNameSpace(ref, NULL)), "TEST_Plain", &status);
    CMPIInstance* instance = CMNewInstance(broker, path, &status);
    const CMPIUint16 size = 7;
    CMSetPropertyFilter(instance, properties, keys);
    CMSetProperty(instance, "Name", name, CMPI_chars);
    CMSetProperty(instance, "Size", &size, CMPI_uint16);
    return instance;
}

static CMPIStatus PlainCleanup(CMPIInstanceMI* mi, const CMPIContext* ctx,
                               CMPIBoolean terminating) {
    (void)mi;
    (void)ctx;
    (void)terminating;
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus PlainEnumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                         const CMPIResult* rslt, const CMPIObjectPath* ref) {
    (void)mi;
    (void)ctx;
    CMReturnObjectPath(rslt, CMGetObjectPath(makeInstance(ref, "one", NULL), NULL));
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus PlainEnumInstances(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                     const CMPIResult* rslt, const CMPIObjectPath* ref,
                                     const char** properties) {
    (void)mi;
    (void)ctx;
    CMReturnInstance(rslt, makeInstance(ref, "one", properties));
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus PlainGetInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                   const CMPIResult* rslt, const CMPIObjectPath* ref,
                                   const char** properties) {
    CMPIStatus status = {CMPI_RC_OK, NULL};
    const CMPIData name = CMGetKey(ref, "Name", &status);
    (void)mi;
    (void)ctx;
    if (status.rc != CMPI_RC_OK) {
        CMReturnWithChars(broker, CMPI_RC_ERR_INVALID_PARAMETER, "no key Name");
    }
    if (strcmp(CMGetCharPtr(name.value.string), "one") == 0) {
        CMReturnInstance(rslt, makeInstance(ref, "one", properties));
    }
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus PlainCreateInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                      const CMPIResult* rslt, const CMPIObjectPath* ref,
                                      const CMPIInstance* inst) {
    (void)mi;
    (void)ctx;
    (void)rslt;
    (void)ref;
    (void)inst;
    CMReturn(CMPI_RC_OK); /* without telling the path */
}

static CMPIStatus PlainModifyInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                      const CMPIResult* rslt, const CMPIObjectPath* ref,
                                      const CMPIInstance* inst, const char** properties) {
    (void)mi;
    (void)ctx;
    (void)rslt;
    (void)ref;
    (void)inst;
    (void)properties;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus PlainDeleteInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                      const CMPIResult* rslt, const CMPIObjectPath* ref) {
    (void)mi;
    (void)ctx;
    (void)rslt;
    (void)ref;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus PlainExecQuery(CMPIInstanceMI* mi, const CMPIContext* ctx, const CMPIResult* rslt,
                                 const CMPIObjectPath* ref, const char* query, const char* lang) {
    (void)mi;
    (void)ctx;
    (void)rslt;
    (void)ref;
    (void)query;
    (void)lang;
    CMReturn(CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED);
}

CMInstanceMIStub(Plain, Plain, broker, CMNoHook)

    static CMPIStatus
    PlainMethodCleanup(CMPIMethodMI* mi, const CMPIContext* ctx, CMPIBoolean terminating) {
    (void)mi;
    (void)ctx;
    (void)terminating;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus PlainInvokeMethod(CMPIMethodMI* mi, const CMPIContext* ctx,
                                    const CMPIResult* rslt, const CMPIObjectPath* ref,
                                    const char* method, const CMPIArgs* in, CMPIArgs* out) {
    (void)mi;
    (void)ctx;
    (void)rslt;
    (void)ref;
    (void)method;
    (void)in;
    (void)out;
    CMReturn(CMPI_RC_OK);
}

CMMethodMIStub(Plain, Plain, broker, CMNoHook)

    CMPI_EXTERN_C CMPIInstanceMI* _Generic_Create_InstanceMI(const CMPIBroker* mb,
                                                             const CMPIContext* ctx,
                                                             const char* miName, CMPIStatus* st) {
    static CMPIInstanceMI mi = {NULL, &instMIFT__};
    (void)ctx;
    broker = mb;
    if (strcmp(miName, "Unwanted") == 0) {
        CMSetStatusWithChars(mb, st, CMPI_RC_ERR_NOT_FOUND, "no such interface");
        return NULL;
    }
    return &mi;
}
