#include "cmpi/StubsInC.h"

static const CMPIBroker* broker_;

static CMPIStatus cSampleCleanup(CMPIInstanceMI* mi, const CMPIContext* ctx, CMPIBoolean last) {
    (void)mi;
    (void)ctx;
    (void)last;
    CMReturn(CMPI_RC_DO_NOT_UNLOAD);
}

static CMPIStatus cSampleEnumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                           const CMPIResult* rslt, const CMPIObjectPath* op) {
    (void)mi;
    (void)ctx;
    CMReturnObjectPath(rslt, op);
    return CMReturnDone(rslt);
}

static CMPIStatus cSampleEnumInstances(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                       const CMPIResult* rslt, const CMPIObjectPath* op,
                                       const char** properties) {
    CMPIUint32 number = 5;
    CMPIInstance* instance = CMNewInstance(broker_, op, NULL);
    (void)mi;
    (void)ctx;
    CMSetPropertyFilter(instance, properties, NULL);
    CMSetProperty(instance, "Name", "text", CMPI_chars);
    CMSetProperty(instance, "Number", &number, CMPI_uint32);
    CMReturnInstance(rslt, instance);
    return CMReturnDone(rslt);
}

static CMPIStatus cSampleGetInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                     const CMPIResult* rslt, const CMPIObjectPath* op,
                                     const char** properties) {
    return cSampleEnumInstances(mi, ctx, rslt, op, properties);
}

static CMPIStatus cSampleCreateInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                        const CMPIResult* rslt, const CMPIObjectPath* op,
                                        const CMPIInstance* inst) {
    (void)mi;
    (void)ctx;
    (void)rslt;
    (void)op;
    (void)inst;
    CMReturn(CMPI_RC_ERR_NOT_SUPPORTED);
}

static CMPIStatus cSampleModifyInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                        const CMPIResult* rslt, const CMPIObjectPath* op,
                                        const CMPIInstance* inst, const char** properties) {
    (void)properties;
    return cSampleCreateInstance(mi, ctx, rslt, op, inst);
}

static CMPIStatus cSampleDeleteInstance(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                        const CMPIResult* rslt, const CMPIObjectPath* op) {
    return cSampleCreateInstance(mi, ctx, rslt, op, NULL);
}

static CMPIStatus cSampleExecQuery(CMPIInstanceMI* mi, const CMPIContext* ctx,
                                   const CMPIResult* rslt, const CMPIObjectPath* op,
                                   const char* query, const char* lang) {
    (void)query;
    (void)lang;
    return cSampleCreateInstance(mi, ctx, rslt, op, NULL);
}

static CMPIStatus cSampleMethodCleanup(CMPIMethodMI* mi, const CMPIContext* ctx, CMPIBoolean last) {
    (void)mi;
    (void)ctx;
    (void)last;
    CMReturn(CMPI_RC_OK);
}

static CMPIStatus cSampleInvokeMethod(CMPIMethodMI* mi, const CMPIContext* ctx,
                                      const CMPIResult* rslt, const CMPIObjectPath* op,
                                      const char* method, const CMPIArgs* in, CMPIArgs* out) {
    CMPIValue value = {0};
    (void)mi;
    (void)ctx;
    (void)op;
    (void)method;
    value.uint32 = CMGetArgCount(in, NULL);
    CMAddArg(out, "Count", &value, CMPI_uint32);
    CMReturnData(rslt, &value, CMPI_uint32);
    return CMReturnDone(rslt);
}

CMInstanceMIStub(cSample, CSample, broker_, CMNoHook)

    CMMethodMIStub(cSample, CSample, broker_, CMNoHook)

        const CMPIBroker* brokerOfCSample(void) {
    return broker_;
}

CMPIStatus statusMadeInC(const CMPIBroker* broker) {
    CMGetMessage(broker, "ID", "$0", NULL, CMFmtArgs2(CMFmtUint(1), CMFmtChars("x")));
    CMReturnWithChars(broker, CMPI_RC_ERR_FAILED, "from C");
}
