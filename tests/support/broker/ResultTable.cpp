#include "support/broker/Call.h"

namespace qelo::test {

namespace {

// Whether the result still takes something.
bool isOpen(Call& call) {
    if (!call.content<CMPIResult>().done) {
        return true;
    }
    call.refuse(CMPI_RC_ERR_FAILED, "result used after returnDone");
    return false;
}

CMPIStatus returnData(const CMPIResult* self, const CMPIValue* value, CMPIType type) {
    Call call("returnData", self);
    const Value data = call.value(value, type);
    if (call.begin() && isOpen(call)) {
        call.state().current().data.push_back(data);
    }
    return call.status();
}

CMPIStatus returnInstance(const CMPIResult* self, const CMPIInstance* instance) {
    Call call("returnInstance", self);
    call.object(instance);
    if (call.begin() && isOpen(call)) {
        call.state().current().instances.push_back(Call::contentOf(instance).visible());
    }
    return call.status();
}

CMPIStatus returnObjectPath(const CMPIResult* self, const CMPIObjectPath* path) {
    Call call("returnObjectPath", self);
    call.object(path);
    if (call.begin() && isOpen(call)) {
        call.state().current().paths.push_back(Call::contentOf(path));
    }
    return call.status();
}

CMPIStatus returnDone(const CMPIResult* self) {
    Call call("returnDone", self);
    if (!call.begin()) {
        return call.status();
    }
    ++call.state().current().doneCount;
    if (isOpen(call)) {
        call.content<CMPIResult>().done = true;
    }
    return call.status();
}

// There are no error objects, so none can be returned.
CMPIStatus returnError(const CMPIResult* self, const CMPIError*) {
    Call call("returnError", self);
    call.refuse(CMPI_RC_ERR_INVALID_HANDLE, "unknown CMPIError as argument");
    call.begin();
    return call.status();
}

} // namespace

const CMPIResultFT* tableResult() {
    static const CMPIResultFT table = {CMPIVersion200,
                                       releaseSlot<CMPIResult>,
                                       cloneSlot<CMPIResult>,
                                       returnData,
                                       returnInstance,
                                       returnObjectPath,
                                       returnDone,
                                       returnError};
    return &table;
}

} // namespace qelo::test
