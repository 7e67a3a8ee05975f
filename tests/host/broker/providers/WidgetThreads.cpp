// A method that does its work in a thread of its own.
#include "Widgets.h"

namespace widgets {
namespace {

struct Work {
    CMPIContext* ctx;
    const CMPIResult* rslt;
    const CMPIObjectPath* op;
    CMPIStatus status;
};

CMPI_THREAD_RETURN CMPI_THREAD_CDECL countInThread(void* parm) {
    auto* work = static_cast<Work*>(parm);
    work->status = CBAttachThread(broker, work->ctx);
    if (work->status.rc != CMPI_RC_OK) {
        return nullptr;
    }
    CMPIStatus st = {};
    CMPIEnumeration* all = CBEnumInstanceNames(broker, work->ctx, work->op, &st);
    CMPIUint32 count = 0;
    while (st.rc == CMPI_RC_OK && CMHasNext(all, nullptr)) {
        CMGetNext(all, nullptr);
        ++count;
    }
    CMReturnData(work->rslt, &count, CMPI_uint32);
    CBDetachThread(broker, work->ctx);
    work->status = {st.rc, nullptr}; // the message ended with the attachment
    return nullptr;
}

} // namespace

CMPIStatus enumerateInThread(const CMPIContext* ctx, const CMPIResult* rslt,
                             const CMPIObjectPath* op) {
    Work work = {CBPrepareAttachThread(broker, ctx), rslt, op, {CMPI_RC_OK, nullptr}};
    CMPI_THREAD_TYPE thread = broker->xft->newThread(countInThread, &work, 0);
    if (!thread || broker->xft->joinThread(thread, nullptr) != 0) {
        CMReturn(CMPI_RC_ERR_FAILED);
    }
    return work.status;
}

} // namespace widgets
